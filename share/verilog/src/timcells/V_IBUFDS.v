// V_IBUFDS: differential input buffer. O is 1 when I is 1 and IB is 0, 0
// when I is 0 and IB is 1, and unknown otherwise.
`timescale 1 ns/1 ps
module V_IBUFDS (I, IB, O);
  parameter IOSTANDARD = "DEFAULT";
  parameter DIFF_TERM = "FALSE";
  input I, IB;
  output O;

  assign O = (I === 1'b1 && IB === 1'b0) ? 1'b1 : (I === 1'b0 && IB === 1'b1) ? 1'b0 : 1'bx;

  specify
    (I => O) = (0, 0);
    (IB => O) = (0, 0);
  endspecify
endmodule
