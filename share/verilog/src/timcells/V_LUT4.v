// V_LUT4: 4-input lookup table. O is bit {I3, I2, I1, I0} of INIT.
`timescale 1 ns/1 ps
module V_LUT4 (I0, I1, I2, I3, O);
  parameter [15:0] INIT = 16'h0000;
  input I0, I1, I2, I3;
  output O;

  // A chain of multiplexers, one input at a time from the highest: each
  // stage keeps the half of the table its input selects. An unknown input
  // keeps the bits where both halves agree and makes the others unknown
  // (the rule of the conditional operator), so an unknown input that does
  // not matter leaves O known. A change of I0 reevaluates the last stage
  // only; continuous assignments simulate faster than a procedural block.
  wire [7:0] t3 = I3 ? INIT[15:8] : INIT[7:0];
  wire [3:0] t2 = I2 ? t3[7:4] : t3[3:0];
  wire [1:0] t1 = I1 ? t2[3:2] : t2[1:0];
  assign O = I0 ? t1[1] : t1[0];

  specify
    (I0 => O) = (0, 0);
    (I1 => O) = (0, 0);
    (I2 => O) = (0, 0);
    (I3 => O) = (0, 0);
  endspecify
endmodule
