// V_MUX2: two-input multiplexer, O = S ? I1 : I0.
module V_MUX2 (
    input  I0,
    input  I1,
    input  S,
    output O
);
  assign O = S ? I1 : I0;
endmodule
