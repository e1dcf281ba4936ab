// V_LUT3: 3-input lookup table. O is bit {I2, I1, I0} of INIT.
module V_LUT3 (I0, I1, I2, O);
  parameter [7:0] INIT = 8'h00;
  input I0, I1, I2;
  output O;

  assign O = INIT[{I2, I1, I0}];
endmodule
