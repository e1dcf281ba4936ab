// V_BUF: buffer, O = I.
module V_BUF (
    input  I,
    output O
);
  assign O = I;
endmodule
