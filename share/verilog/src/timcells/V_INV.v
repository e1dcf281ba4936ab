// V_INV: inverter, O = ~I.
`timescale 1 ns/1 ps
module V_INV (I, O);
  input I;
  output O;

  not n0 (O, I);

  specify
    (I => O) = (0, 0);
  endspecify
endmodule
