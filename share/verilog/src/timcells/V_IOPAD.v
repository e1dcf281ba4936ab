// V_IOPAD: bidirectional pad. PAD stands for the package pin.
`timescale 1 ns/1 ps
module V_IOPAD (PAD);
  inout PAD;
endmodule
