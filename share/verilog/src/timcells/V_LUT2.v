// V_LUT2: 2-input lookup table. O is bit {I1, I0} of INIT.
`timescale 1 ns/1 ps
module V_LUT2 (I0, I1, O);
  parameter [3:0] INIT = 4'h0;
  input I0, I1;
  output O;

  // A chain of multiplexers, one input at a time from the highest: each
  // stage keeps the half of the table its input selects. An unknown input
  // keeps the bits where both halves agree and makes the others unknown
  // (the rule of the conditional operator), so an unknown input that does
  // not matter leaves O known. A change of I0 reevaluates the last stage
  // only; continuous assignments simulate faster than a procedural block.
  wire [1:0] t1 = I1 ? INIT[3:2] : INIT[1:0];
  assign O = I0 ? t1[1] : t1[0];

  specify
    (I0 => O) = (0, 0);
    (I1 => O) = (0, 0);
  endspecify
endmodule
