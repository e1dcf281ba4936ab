// V_RAMB4_S8: 512 x 8 single-port block RAM. On the rising edge of CLK with
// EN 1: when WE is 1 DI is written at ADDR and appears on DO (write first),
// else DO reads the byte at ADDR; RST 1 clears DO instead of reading (the
// write still happens). INIT_00 holds bytes 0 to 31 (byte i in bits
// 8i+7..8i), INIT_01 bytes 32 to 63, and so on. While the global set/reset
// chipwide.GSR is 1 DO is 0 and the clock is ignored.
`timescale 1 ns/1 ps
module V_RAMB4_S8 (CLK, EN, WE, RST, ADDR, DI, DO);
  parameter [255:0] INIT_00 = 256'h0000000000000000000000000000000000000000000000000000000000000000;
  parameter [255:0] INIT_01 = 256'h0000000000000000000000000000000000000000000000000000000000000000;
  parameter [255:0] INIT_02 = 256'h0000000000000000000000000000000000000000000000000000000000000000;
  parameter [255:0] INIT_03 = 256'h0000000000000000000000000000000000000000000000000000000000000000;
  parameter [255:0] INIT_04 = 256'h0000000000000000000000000000000000000000000000000000000000000000;
  parameter [255:0] INIT_05 = 256'h0000000000000000000000000000000000000000000000000000000000000000;
  parameter [255:0] INIT_06 = 256'h0000000000000000000000000000000000000000000000000000000000000000;
  parameter [255:0] INIT_07 = 256'h0000000000000000000000000000000000000000000000000000000000000000;
  parameter [255:0] INIT_08 = 256'h0000000000000000000000000000000000000000000000000000000000000000;
  parameter [255:0] INIT_09 = 256'h0000000000000000000000000000000000000000000000000000000000000000;
  parameter [255:0] INIT_0A = 256'h0000000000000000000000000000000000000000000000000000000000000000;
  parameter [255:0] INIT_0B = 256'h0000000000000000000000000000000000000000000000000000000000000000;
  parameter [255:0] INIT_0C = 256'h0000000000000000000000000000000000000000000000000000000000000000;
  parameter [255:0] INIT_0D = 256'h0000000000000000000000000000000000000000000000000000000000000000;
  parameter [255:0] INIT_0E = 256'h0000000000000000000000000000000000000000000000000000000000000000;
  parameter [255:0] INIT_0F = 256'h0000000000000000000000000000000000000000000000000000000000000000;
  parameter XON = "TRUE";
  parameter MSGON = "TRUE";
  input CLK, EN, WE, RST;
  input [8:0] ADDR;
  input [7:0] DI;
  output [7:0] DO;

  wire [8:0] addr = ADDR;
  wire [7:0] di = DI;
  reg [7:0] do_out;

  assign DO = do_out;

  wire gsr = chipwide.GSR;
  reg [7:0] mem[0:511];
  reg notifier;
  integer i;

  initial begin
    for (i = 0; i < 32; i = i + 1) begin
      mem[0 + i] = INIT_00[8 * i +: 8];
      mem[32 + i] = INIT_01[8 * i +: 8];
      mem[64 + i] = INIT_02[8 * i +: 8];
      mem[96 + i] = INIT_03[8 * i +: 8];
      mem[128 + i] = INIT_04[8 * i +: 8];
      mem[160 + i] = INIT_05[8 * i +: 8];
      mem[192 + i] = INIT_06[8 * i +: 8];
      mem[224 + i] = INIT_07[8 * i +: 8];
      mem[256 + i] = INIT_08[8 * i +: 8];
      mem[288 + i] = INIT_09[8 * i +: 8];
      mem[320 + i] = INIT_0A[8 * i +: 8];
      mem[352 + i] = INIT_0B[8 * i +: 8];
      mem[384 + i] = INIT_0C[8 * i +: 8];
      mem[416 + i] = INIT_0D[8 * i +: 8];
      mem[448 + i] = INIT_0E[8 * i +: 8];
      mem[480 + i] = INIT_0F[8 * i +: 8];
    end
    do_out = 8'h00;
  end

  // One block owns the output register; a timing violation toggles the
  // notifier and, with XON "TRUE", makes DO unknown (see V_FD).
  wire hold = gsr === 1'b1;
  wire viol = (XON == "TRUE") ? notifier : 1'bx;
  reg viol_seen;

  always @(posedge CLK or posedge hold or posedge viol or negedge viol)
    if (viol !== viol_seen) begin
      viol_seen = viol;
      do_out <= 8'hxx;
    end else if (hold) do_out <= 8'h00;
    else if (EN === 1'b1) begin
      if (WE === 1'b1) mem[addr] <= di;
      if (RST === 1'b1) do_out <= 8'h00;
      else if (WE === 1'b1) do_out <= di;
      else do_out <= mem[addr];
    end else if (EN !== 1'b0) begin
      do_out <= 8'hxx;
    end

  specify
    (posedge CLK *> (DO +: DI)) = (0, 0);
    $setuphold(posedge CLK, ADDR, 0, 0, notifier);
    $setuphold(posedge CLK, DI, 0, 0, notifier);
    $setuphold(posedge CLK, EN, 0, 0, notifier);
    $setuphold(posedge CLK, WE, 0, 0, notifier);
    $setuphold(posedge CLK, RST, 0, 0, notifier);
    $width(posedge CLK, 0, 0, notifier);
    $width(negedge CLK, 0, 0, notifier);
  endspecify
endmodule
