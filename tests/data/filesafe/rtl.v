module leaf(input a, input b, output y); assign y = a ^ b; endmodule
module top(input [1:0] d, output y, output z);
  leaf u(.a(d[0]), .b(d[1]), .y(y));
  assign z = ~d[0];
endmodule
