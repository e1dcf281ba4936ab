// Library lookup tables and flip-flops with parameters, an x on an output
// buffer's input.
module top(input clk, input [3:0] a, output q, output [1:0] o);
  reg r = 1'b1;
  always @(posedge clk) r <= ^a ? a[0] & a[1] : a[2] | a[3];
  assign q = r;
  assign o = {a[0] ^ a[3], 1'bx};
endmodule
