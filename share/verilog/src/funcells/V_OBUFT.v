// V_OBUFT: tristate output buffer, O = I while T is 0, floating while T
// is 1.
module V_OBUFT (
    input  I,
    input  T,
    output O
);
  parameter IOSTANDARD = "DEFAULT";
  parameter DRIVE = 12;
  parameter SLEW = "SLOW";

  assign O = T ? 1'bz : I;
endmodule
