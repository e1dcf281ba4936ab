// V_LUT1: 1-input lookup table. O is bit {I0} of INIT.
`timescale 1 ns/1 ps
module V_LUT1 (I0, O);
  parameter [1:0] INIT = 2'h0;
  input I0;
  output O;

  // A chain of multiplexers, one input at a time from the highest: each
  // stage keeps the half of the table its input selects. An unknown input
  // keeps the bits where both halves agree and makes the others unknown
  // (the rule of the conditional operator), so an unknown input that does
  // not matter leaves O known. A change of I0 reevaluates the last stage
  // only; continuous assignments simulate faster than a procedural block.
  assign O = I0 ? INIT[1] : INIT[0];

  specify
    (I0 => O) = (0, 0);
  endspecify
endmodule
