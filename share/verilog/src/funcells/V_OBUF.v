// V_OBUF: output buffer, O = I.
module V_OBUF (
    input  I,
    output O
);
  parameter IOSTANDARD = "DEFAULT";
  parameter DRIVE = 12;
  parameter SLEW = "SLOW";

  assign O = I;
endmodule
