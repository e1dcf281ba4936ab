// V_BUFGMUX_1: global clock multiplexer selecting on the other value of S:
// O = I0 while S is 1 and I1 while S is 0. An unknown S gives an unknown O
// unless both inputs agree.
`timescale 1 ns/1 ps
module V_BUFGMUX_1 (I0, I1, S, O);
  input I0, I1, S;
  output O;

  assign O = (S === 1'b1) ? I0 : (S === 1'b0) ? I1 : (I0 === I1) ? I0 : 1'bx;

  specify
    (I0 => O) = (0, 0);
    (I1 => O) = (0, 0);
    (S => O) = (0, 0);
  endspecify
endmodule
