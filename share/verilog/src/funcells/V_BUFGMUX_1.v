// V_BUFGMUX_1: global clock multiplexer selecting on the other value of S,
// O = S ? I0 : I1.
module V_BUFGMUX_1 (
    input  I0,
    input  I1,
    input  S,
    output O
);
  assign O = S ? I0 : I1;
endmodule
