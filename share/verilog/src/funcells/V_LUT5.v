// V_LUT5: 5-input lookup table. O is bit {I4, I3, I2, I1, I0} of INIT.
module V_LUT5 (I0, I1, I2, I3, I4, O);
  parameter [31:0] INIT = 32'h00000000;
  input I0, I1, I2, I3, I4;
  output O;

  assign O = INIT[{I4, I3, I2, I1, I0}];
endmodule
