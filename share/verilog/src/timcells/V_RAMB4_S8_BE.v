// V_RAMB4_S8_BE: 512 x 8 single-port block RAM, like V_RAMB4_S8, whose buses are
// declared from index 0 up ([0:8], [0:7]) while the installation's cell
// table lists them as [8:0] and [7:0]: the netlist writer connects bit i of
// a netlist bus to index i here (big-ending timing cell), and index i is the
// bit of weight 2**i.
`timescale 1 ns/1 ps
module V_RAMB4_S8_BE (CLK, EN, WE, RST, ADDR, DI, DO);
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
  // Declared from index 0 up on purpose (see above), which Verilator's lint
  // would otherwise question.
  /* verilator lint_off LITENDIAN */
  input [0:8] ADDR;
  input [0:7] DI;
  output [0:7] DO;
  /* verilator lint_on LITENDIAN */

  // The buses count from 0 up: index i of each bus is the bit of weight
  // 2**i, whatever its position in the declaration.
  wire [8:0] addr;
  wire [7:0] di;
  reg [7:0] do_out;

  genvar b;
  generate
    for (b = 0; b < 9; b = b + 1) begin : addr_bits
      assign addr[b] = ADDR[b];
    end
    for (b = 0; b < 8; b = b + 1) begin : data_bits
      assign di[b] = DI[b];
      assign DO[b] = do_out[b];
    end
  endgenerate

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
