// V_GND: constant 0 on G.
`timescale 1 ns/1 ps
module V_GND (G);
  output G;

  assign G = 1'b0;
endmodule
