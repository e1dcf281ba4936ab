// Reference for ram_pair: both memories as V_RAMB4_S8.
module ram_pair (
    input clk,
    input en,
    input we,
    input rst,
    input [8:0] addr,
    input [7:0] din,
    output [7:0] dout_le,
    output [7:0] dout_be
);
  localparam [255:0] CONTENT_00 = 256'h1f1e1d1c1b1a191817161514131211100f0e0d0c0b0a09080706050403020100;
  localparam [255:0] CONTENT_07 = 256'hfedcba9876543210_0123456789abcdef_8040201008040201_a5a55a5a3c3cc3c3;

  wire [8:0] a = {1'b0, addr[7] ? 3'b111 : 3'b000, addr[4:0]};

  V_RAMB4_S8 #(
      .INIT_00(CONTENT_00),
      .INIT_07(CONTENT_07)
  ) ram_le (
      .CLK(clk),
      .EN(en),
      .WE(we),
      .RST(rst),
      .ADDR(a),
      .DI(din),
      .DO(dout_le)
  );
  V_RAMB4_S8 #(
      .INIT_00(CONTENT_00),
      .INIT_07(CONTENT_07)
  ) ram_be (
      .CLK(clk),
      .EN(en),
      .WE(we),
      .RST(rst),
      .ADDR(a),
      .DI(din),
      .DO(dout_be)
  );
endmodule
