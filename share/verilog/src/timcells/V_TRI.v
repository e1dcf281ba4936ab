// V_TRI: internal tristate buffer. O = I while T is 0; O floats while T
// is 1.
`timescale 1 ns/1 ps
module V_TRI (I, T, O);
  input I, T;
  output O;

  bufif0 b0 (O, I, T);

  specify
    (I => O) = (0, 0);
    (T => O) = (0, 0);
  endspecify
endmodule
