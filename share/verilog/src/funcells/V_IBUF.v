// V_IBUF: input buffer, O = I.
module V_IBUF (
    input  I,
    output O
);
  parameter IOSTANDARD = "DEFAULT";

  assign O = I;
endmodule
