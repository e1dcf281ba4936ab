// V_IOBUF: bidirectional buffer on the pad IO: an output buffer V_OBUFT
// driving IO from I (floating while T is 1 or chipwide.GTS is 1) and an
// input buffer V_IBUF reading IO to O. The netlist writer copies both models
// ahead of this one.
`timescale 1 ns/1 ps
module V_IOBUF (I, T, O, IO);
  parameter IOSTANDARD = "DEFAULT";
  parameter DRIVE = 12;
  parameter SLEW = "SLOW";
  input I, T;
  output O;
  inout IO;

  V_OBUFT #(.IOSTANDARD(IOSTANDARD), .DRIVE(DRIVE), .SLEW(SLEW)) obuft (.I(I), .T(T), .O(IO));
  V_IBUF #(.IOSTANDARD(IOSTANDARD)) ibuf (.I(IO), .O(O));
endmodule
