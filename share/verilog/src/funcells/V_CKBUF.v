// V_CKBUF: global clock buffer, O = I.
module V_CKBUF (
    input  I,
    output O
);
  assign O = I;
endmodule
