`timescale 1 ns/1 ps
// Measures, in the bench of make_tb.py, the shortest time from a rising
// clock edge to a change of the outputs, and prints it at the end: zero on
// the RTL, the annotated clock-to-out delay on a netlist that read its
// timing file. (The bench raises the reset 5 ns into a cycle, so the
// outputs it clears change long after the edge.)
module nlw_delay_probe;
  realtime last = 0.0, least = 1.0e9;
  always @(posedge nlw_tb.clk) last = $realtime;
  always @(nlw_tb.acc or nlw_tb.count or nlw_tb.above)
    if ($realtime > 250.0 && $realtime - last < least) least = $realtime - last;
  initial begin
    #(`PROBE_END);
    $display("least delay %0.3f ns", least);
  end
endmodule
