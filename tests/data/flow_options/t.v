module t #(parameter W = 4, parameter M = "A") (input clk, input [W-1:0] a, output reg [W-1:0] y);
  always @(posedge clk) y <= (M == "B") ? a : ~a;
endmodule
