// V_VCC: constant 1 on P.
module V_VCC (
    output P
);
  assign P = 1'b1;
endmodule
