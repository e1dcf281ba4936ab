// V_LUT1: 1-input lookup table. O is bit {I0} of INIT.
module V_LUT1 (I0, O);
  parameter [1:0] INIT = 2'h0;
  input I0;
  output O;

  assign O = INIT[{I0}];
endmodule
