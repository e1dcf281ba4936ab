// V_OBUF: output buffer to a pad, O = I; tristated while the global
// tristate chipwide.GTS is 1.
`timescale 1 ns/1 ps
module V_OBUF (I, O);
  parameter IOSTANDARD = "DEFAULT";
  parameter DRIVE = 12;
  parameter SLEW = "SLOW";
  input I;
  output O;

  wire gts = chipwide.GTS;

  bufif0 b0 (O, I, gts);

  specify
    (I => O) = (0, 0);
  endspecify
endmodule
