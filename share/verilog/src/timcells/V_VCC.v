// V_VCC: constant 1 on P.
`timescale 1 ns/1 ps
module V_VCC (P);
  output P;

  assign P = 1'b1;
endmodule
