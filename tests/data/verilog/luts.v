
module t(input [3:0] a, input [3:0] b, input cin, output [4:0] s, output eq);
  assign s = a + b + cin;
  assign eq = a == b;
endmodule