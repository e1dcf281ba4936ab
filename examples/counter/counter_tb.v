// Self-checking test bench of the counter example. It runs on the RTL
//   iverilog -g2005 -o counter.vvp counter.v counter_tb.v
// and on the netlist that qdb2ver -ism writes from counter.json
//   iverilog -g2005 -o counter.vvp counter_netlist.v counter_tb.v
// and prints PASS when the counter counts, loads, resets and decodes its
// digit as it should. The first 100 ns are left to the netlist's global
// set/reset.
`timescale 1 ns/1 ps
module counter_tb;
  reg clk = 1'b0;
  reg rst = 1'b1;
  reg en = 1'b0;
  reg load = 1'b0;
  reg [7:0] din = 8'h00;
  wire [7:0] count;
  wire [6:0] segments;
  wire tick;

  counter uut (
      .clk(clk),
      .rst(rst),
      .en(en),
      .load(load),
      .din(din),
      .count(count),
      .segments(segments),
      .tick(tick)
  );

  always #10 clk = ~clk;

  reg [7:0] expected;
  integer errors = 0;
  integer i;

  function [6:0] seg7;
    input [3:0] digit;
    case (digit)
      4'h0: seg7 = 7'b0111111;
      4'h1: seg7 = 7'b0000110;
      4'h2: seg7 = 7'b1011011;
      4'h3: seg7 = 7'b1001111;
      4'h4: seg7 = 7'b1100110;
      4'h5: seg7 = 7'b1101101;
      4'h6: seg7 = 7'b1111101;
      4'h7: seg7 = 7'b0000111;
      4'h8: seg7 = 7'b1111111;
      4'h9: seg7 = 7'b1101111;
      4'ha: seg7 = 7'b1110111;
      4'hb: seg7 = 7'b1111100;
      4'hc: seg7 = 7'b0111001;
      4'hd: seg7 = 7'b1011110;
      4'he: seg7 = 7'b1111001;
      default: seg7 = 7'b1110001;
    endcase
  endfunction

  task expect_state;
    begin
      if (count !== expected || segments !== seg7(expected[3:0]) ||
          tick !== (en && expected == 8'hff)) begin
        errors = errors + 1;
        $display("FAIL at %0t: count %h segments %b tick %b, expected count %h", $time, count,
                 segments, tick, expected);
      end
    end
  endtask

  // Inputs change on the falling edge; the state is checked just before the
  // next rising edge.
  task cycle;
    begin
      @(posedge clk);
      #9 expect_state;
      @(negedge clk);
    end
  endtask

  initial begin
    #120;
    @(negedge clk);
    expected = 8'h00;
    cycle;  // reset
    rst = 1'b0;
    en = 1'b1;
    for (i = 0; i < 20; i = i + 1) begin
      expected = expected + 8'd1;
      cycle;
    end
    load = 1'b1;
    din = 8'hfd;
    expected = 8'hfd;
    cycle;
    load = 1'b0;
    for (i = 0; i < 5; i = i + 1) begin
      expected = expected + 8'd1;
      cycle;
    end
    en = 1'b0;
    cycle;
    rst = 1'b1;
    expected = 8'h00;
    cycle;
    if (errors == 0) $display("PASS: counter counts, loads, resets and decodes");
    else $display("FAIL: %0d errors", errors);
    $finish;
  end
endmodule
