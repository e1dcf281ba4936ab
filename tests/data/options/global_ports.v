// A shift register with initial values and output buffers, one of them
// tristate: the design of the global port check.
module gd (
    input clk,
    input d,
    input oe,
    output [3:0] q,
    output t
);
  reg [3:0] r = 4'b1010;
  always @(posedge clk) r <= {r[2:0], d};
  assign q = r;
  assign t = oe ? r[0] : 1'bz;
endmodule
