// V_LUT2: 2-input lookup table. O is bit {I1, I0} of INIT.
module V_LUT2 (I0, I1, O);
  parameter [3:0] INIT = 4'h0;
  input I0, I1;
  output O;

  assign O = INIT[{I1, I0}];
endmodule
