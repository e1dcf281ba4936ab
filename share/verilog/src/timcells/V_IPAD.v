// V_IPAD: input pad. PAD stands for the package pin; the test bench drives
// the net on it, the cell itself drives nothing.
`timescale 1 ns/1 ps
module V_IPAD (PAD);
  output PAD;
endmodule
