// V_OBUFT: tristate output buffer to a pad. O = I while T is 0; O floats
// while T is 1 or the global tristate chipwide.GTS is 1.
`timescale 1 ns/1 ps
module V_OBUFT (I, T, O);
  parameter IOSTANDARD = "DEFAULT";
  parameter DRIVE = 12;
  parameter SLEW = "SLOW";
  input I, T;
  output O;

  wire gts = chipwide.GTS;
  wire off = T | gts;

  bufif0 b0 (O, I, off);

  specify
    (I => O) = (0, 0);
    (T => O) = (0, 0);
  endspecify
endmodule
