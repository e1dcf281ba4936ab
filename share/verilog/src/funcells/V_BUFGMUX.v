// V_BUFGMUX: global clock multiplexer, O = S ? I1 : I0.
module V_BUFGMUX (
    input  I0,
    input  I1,
    input  S,
    output O
);
  assign O = S ? I1 : I0;
endmodule
