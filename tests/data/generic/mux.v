// Two levels of hierarchy, a shared sub-module used twice, a synchronous reset.
module sel(input [2:0] s, input [7:0] d, output y);
  assign y = d[s];
endmodule

module pair(input clk, input srst, input [2:0] s, input [7:0] d, output reg [1:0] r);
  wire y0, y1;
  sel a(.s(s), .d(d), .y(y0));
  sel b(.s(~s), .d(d), .y(y1));
  always @(posedge clk) if (srst) r <= 2'b00; else r <= {y1, y0};
endmodule

module mux(input clk, input srst, input [2:0] s, input [7:0] d, output [1:0] r, output [3:0] z);
  pair p(.clk(clk), .srst(srst), .s(s), .d(d), .r(r));
  assign z = {d[7:6], 2'b01};
endmodule
