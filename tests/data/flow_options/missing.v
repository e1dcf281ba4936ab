module t(input a, output y);
  sub u(.a(a), .y(y));
endmodule
