// The design of the timing checks: an accumulator over an 8-bit bus (a
// carry chain), a counter and a registered compare, with an asynchronous
// reset; every output is registered, so each output change follows a clock
// edge (or the reset) by the annotated clock-to-out delay.
module timed (
    input clk,
    input rst,
    input en,
    input [7:0] a,
    input [7:0] b,
    output reg [7:0] acc,
    output reg [7:0] count,
    output reg above
);
  always @(posedge clk or posedge rst)
    if (rst) begin
      acc <= 8'd0;
      count <= 8'd0;
      above <= 1'b0;
    end else begin
      if (en) acc <= acc + a + b;
      count <= count + 8'd1;
      above <= acc > count;
    end
endmodule
