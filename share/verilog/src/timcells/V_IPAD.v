// V_IPAD: input pad. PAD stands for the package pin; the test bench drives
// the net on it, the cell itself drives nothing. The cell table calls PAD
// an output (the pad drives the design); the model declares it an input,
// since a simulator or a linter takes an output port for a driver of the
// top-level input port it sits on.
`timescale 1 ns/1 ps
module V_IPAD (PAD);
  input PAD;
endmodule
