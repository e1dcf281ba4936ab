// V_IBUF: input buffer from a pad, O = I (a floating pad reads unknown).
`timescale 1 ns/1 ps
module V_IBUF (I, O);
  parameter IOSTANDARD = "DEFAULT";
  input I;
  output O;

  buf b0 (O, I);

  specify
    (I => O) = (0, 0);
  endspecify
endmodule
