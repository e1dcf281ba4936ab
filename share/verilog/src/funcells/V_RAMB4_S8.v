// V_RAMB4_S8: 512 x 8 single-port block RAM. On the rising edge of CLK with
// EN 1: when WE is 1 DI is written at ADDR and appears on DO, else DO reads
// the byte at ADDR; RST 1 clears DO instead. INIT_00 holds bytes 0 to 31.
module V_RAMB4_S8 (
    (* clkbuf_sink *) input CLK,
    input EN,
    input WE,
    input RST,
    input [8:0] ADDR,
    input [7:0] DI,
    output [7:0] DO
);
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

  wire [8:0] addr = ADDR;
  wire [7:0] di = DI;
  reg [7:0] do_out;

  assign DO = do_out;

  reg [7:0] mem[0:511];
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

  always @(posedge CLK)
    if (EN) begin
      if (WE) mem[addr] <= di;
      if (RST) do_out <= 8'h00;
      else if (WE) do_out <= di;
      else do_out <= mem[addr];
    end
endmodule
