// V_IBUFDS: differential input buffer; O follows I (IB is its complement).
module V_IBUFDS (
    input  I,
    input  IB,
    output O
);
  parameter IOSTANDARD = "DEFAULT";
  parameter DIFF_TERM = "FALSE";

  assign O = I;
endmodule
