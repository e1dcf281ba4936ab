// V_TRI: internal tristate buffer, O = I while T is 0, floating while T
// is 1.
module V_TRI (
    input  I,
    input  T,
    output O
);
  assign O = T ? 1'bz : I;
endmodule
