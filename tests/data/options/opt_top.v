// The design every option of the option table runs on: a sub-module, a
// flop with an initial value, a tristate output, a block RAM, a pad with its
// package pin and a net the translation file lists.
module sub (
    input a,
    input b,
    output y
);
  assign y = a & b;
endmodule

module top (
    input clk,
    input [1:0] d,
    input oe,
    output q,
    output t,
    output y,
    output [7:0] dout
);
  (* LOC = "P1" *) V_IPAD p_clk (.PAD(clk));
  reg r = 1'b1;
  always @(posedge clk) r <= d[0];
  assign q = r;
  assign t = oe ? r : 1'bz;
  (* keep *) wire w;
  sub u (
      .a(d[0]),
      .b(d[1]),
      .y(w)
  );
  assign y = w;
  V_RAMB4_S8 #(
      .INIT_00(256'h0102)
  ) ram (
      .CLK(clk),
      .EN(1'b1),
      .WE(1'b0),
      .RST(1'b0),
      .ADDR(9'd0),
      .DI(8'd0),
      .DO(dout)
  );
endmodule
