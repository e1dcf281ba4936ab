module my_cell(input A_b, output \endmodule , output unnamed);
  parameter \a-b  = 0;
endmodule
module unnamed(input A, output Y); assign Y = A; endmodule
