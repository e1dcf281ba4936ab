// Drives the ports that -gp GSR_PORT and -tp GTS_PORT bring out: a pulse on
// GSR_PORT puts every flop back to its initial value, GTS_PORT high floats
// every output buffer.
module bench;
  reg clk = 0, d = 0, oe = 1, GSR_PORT = 0, GTS_PORT = 0;
  wire [3:0] q;
  wire t;
  gd uut (.clk(clk), .d(d), .oe(oe), .q(q), .t(t), .GSR_PORT(GSR_PORT), .GTS_PORT(GTS_PORT));
  always #5 clk = ~clk;
  task check(input ok, input [8*40-1:0] what);
    if (!ok) begin
      $display("FAIL %0s: q=%b t=%b at %0t", what, q, t, $time);
      $finish;
    end
  endtask
  initial begin
    #2 check(q === 4'b1010, "initial value");
    d = 1;
    #50 check(q === 4'b1111, "shifted");
    GSR_PORT = 1;
    #3 check(q === 4'b1010, "reset by the port");
    #20 check(q === 4'b1010, "held while the port is high");
    GSR_PORT = 0;
    #2 GTS_PORT = 1;
    #1 check(q === 4'bzzzz && t === 1'bz, "floated by the port");
    GTS_PORT = 0;
    #1 check(q !== 4'bzzzz && t !== 1'bz, "driven again");
    $display("PASS");
    $finish;
  end
endmodule
