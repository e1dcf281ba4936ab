module t(input a, output y);
  assign y = a +;
endmodule
