// $Header: chipwide.v $
// chipwide: the device's global signals, reached by the cell models as
// chipwide.GSR and chipwide.GTS.
//
// GSR, the global set/reset, is 1 for the first 100 ns of a simulation, like
// the device's power-on reset: every flop and block RAM output holds its
// initial value meanwhile. GTS, the global tristate, is 0: while it is 1
// every output buffer floats.
//
// Both are nets with weak drivers (constant 0 for yosys, which reads
// neither strengths nor delays), so that a test bench can take them over
// with an ordinary continuous assignment such as
//   assign chipwide.GSR = my_gsr;
//
// The netlist writer may copy this module into a netlist inside an
// `ifndef CHIPWIDE guard; the module defines CHIPWIDE_V itself so that a
// test bench that also includes this file defines it only once.
`ifndef CHIPWIDE_V
`define CHIPWIDE_V
`ifndef CHIPWIDE
`define CHIPWIDE
`endif
`timescale 1 ns/1 ps
module chipwide;
  wire GSR;
  wire GTS;
`ifdef YOSYS
  // Synthesis and formal tools see the globals inactive: no drive
  // strengths, no delays.
  assign GSR = 1'b0;
  assign GTS = 1'b0;
`else
  reg gsr_drive;
  reg gts_drive;

  assign (weak1, weak0) GSR = gsr_drive;
  assign (weak1, weak0) GTS = gts_drive;

  initial begin
    gsr_drive = 1'b1;
    gts_drive = 1'b0;
    #100 gsr_drive = 1'b0;
  end
`endif
endmodule
`endif
