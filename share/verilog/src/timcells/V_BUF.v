// V_BUF: buffer, O = I.
`timescale 1 ns/1 ps
module V_BUF (I, O);
  input I;
  output O;

  buf b0 (O, I);

  specify
    (I => O) = (0, 0);
  endspecify
endmodule
