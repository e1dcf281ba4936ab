// V_LUT4: 4-input lookup table. O is bit {I3, I2, I1, I0} of INIT.
module V_LUT4 (I0, I1, I2, I3, O);
  parameter [15:0] INIT = 16'h0000;
  input I0, I1, I2, I3;
  output O;

  assign O = INIT[{I3, I2, I1, I0}];
endmodule
