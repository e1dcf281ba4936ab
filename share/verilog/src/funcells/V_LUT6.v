// V_LUT6: 6-input lookup table. O is bit {I5, I4, I3, I2, I1, I0} of INIT.
module V_LUT6 (I0, I1, I2, I3, I4, I5, O);
  parameter [63:0] INIT = 64'h0000000000000000;
  input I0, I1, I2, I3, I4, I5;
  output O;

  assign O = INIT[{I5, I4, I3, I2, I1, I0}];
endmodule
