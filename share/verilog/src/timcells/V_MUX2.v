// V_MUX2: two-input multiplexer, O = S ? I1 : I0. An unknown S gives an
// unknown O unless both inputs agree.
`timescale 1 ns/1 ps
module V_MUX2 (I0, I1, S, O);
  input I0, I1, S;
  output O;

  assign O = (S === 1'b0) ? I0 : (S === 1'b1) ? I1 : (I0 === I1) ? I0 : 1'bx;

  specify
    (I0 => O) = (0, 0);
    (I1 => O) = (0, 0);
    (S => O) = (0, 0);
  endspecify
endmodule
