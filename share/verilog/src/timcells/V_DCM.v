// V_DCM: digital clock manager, a simple behavioural model.
//
// The model measures the period of CLKIN (halved first when
// CLKIN_DIVIDE_BY_2 is "TRUE") and raises LOCKED on its fourth rising edge
// after RST was released. CLK0 follows the input clock and CLK180 is its
// inverse from the start; CLK90 and CLK270 follow a quarter period later.
// Once a period is known, CLK2X and CLK2X180 run at twice the input
// frequency; once locked, CLKDV runs at the input frequency divided by
// CLKDV_DIVIDE (1.5, 2.0, 2.5, ...) and CLKFX at the input frequency times
// CLKFX_MULTIPLY / CLKFX_DIVIDE, both starting on a rising input edge. While
// RST is 1 every output is 0. The feedback input CLKFB, the phase shift and
// the frequency mode attributes do not change the model's outputs.
`timescale 1 ns/1 ps
module V_DCM (CLKIN, CLKFB, RST, CLK0, CLK90, CLK180, CLK270, CLK2X, CLK2X180, CLKDV, CLKFX,
              LOCKED);
  parameter real CLKDV_DIVIDE = 2.0;
  parameter integer CLKFX_DIVIDE = 1;
  parameter integer CLKFX_MULTIPLY = 4;
  parameter CLKIN_DIVIDE_BY_2 = "FALSE";
  parameter real CLKIN_PERIOD = 0.0;
  parameter CLKOUT_PHASE_SHIFT = "NONE";
  parameter CLK_FEEDBACK = "1X";
  parameter DESKEW_ADJUST = "SYSTEM_SYNCHRONOUS";
  parameter DFS_FREQUENCY_MODE = "LOW";
  parameter DLL_FREQUENCY_MODE = "LOW";
  parameter DSS_MODE = "NONE";
  parameter DUTY_CYCLE_CORRECTION = "TRUE";
  parameter integer MAXPERCLKIN = 1000000;
  parameter integer MAXPERPSCLK = 100000000;
  parameter integer PHASE_SHIFT = 0;
  parameter STARTUP_WAIT = "FALSE";
  input CLKIN, CLKFB, RST;
  output CLK0, CLK90, CLK180, CLK270, CLK2X, CLK2X180, CLKDV, CLKFX, LOCKED;

  localparam integer LOCK_EDGES = 4;
  // CLKDV_DIVIDE in thousandths, so that the divided clock counts in
  // integers (1.5, 2.0, 2.5, ... are exact).
  localparam integer DV_MILLI = $rtoi(CLKDV_DIVIDE * 1000.0 + 0.5);

  reg clkin_half;
  wire clk_in = (CLKIN_DIVIDE_BY_2 == "TRUE") ? clkin_half : CLKIN;
  wire run = RST !== 1'b1;
  wire clk0 = run & clk_in;

  // Times in picoseconds, as integers: the model stays readable by tools
  // that know no real variables.
  reg [63:0] period, last_rise;
  integer rises, dv_milli, dv_next, fx_count, n;
  reg locked, clk90, clk2x, clkdv, clkfx, fx_start, clk_seen;

  initial begin
    clkin_half = 1'b0;
    period = 0;
    last_rise = 0;
    rises = 0;
    locked = 1'b0;
    clk90 = 1'b0;
    clk2x = 1'b0;
    clkdv = 1'b0;
    clkfx = 1'b0;
    fx_start = 1'b0;
  end

  always @(posedge CLKIN) clkin_half <= ~clkin_half;

  // Every edge of the input clock, and RST: the period measurement and
  // lock on the rising edges, then the divided and synthesized clocks, in
  // this order so that they start on the edge that locks. The block owns
  // the lock state, so RST clears it here too.
  always @(clk_in or RST) begin
    if (!run) begin
      rises = 0;
      locked = 1'b0;
    end else if (clk_in === 1'b1 && clk_seen !== 1'b1) begin
      // Rounded to picoseconds on purpose.
      /* verilator lint_off REALCVT */
      if (rises > 0) period = $realtime * 1000 - last_rise;
      last_rise = $realtime * 1000;
      /* verilator lint_on REALCVT */
      if (rises < LOCK_EDGES) rises = rises + 1;
      if (rises == LOCK_EDGES && !locked) begin
        locked = 1'b1;
        clkdv = 1'b1;
        dv_milli = 0;
        dv_next = DV_MILLI;
        fx_count = 0;
      end else if (locked) begin
        divide;
      end
      // CLKFX_MULTIPLY periods in every CLKFX_DIVIDE input periods,
      // restarted on a rising input edge so that they do not drift.
      if (locked) begin
        if (fx_count == 0) fx_start = ~fx_start;
        fx_count = (fx_count + 1) % CLKFX_DIVIDE;
      end
    end else if (clk_in !== clk_seen && locked) begin
      divide;
    end
    clk_seen = clk_in;
  end

  // Divided clock: toggles after every CLKDV_DIVIDE input half periods,
  // rounded up to whole half periods.
  task divide;
    begin
      dv_milli = dv_milli + 1000;
      if (dv_milli >= dv_next) begin
        clkdv = ~clkdv;
        dv_next = dv_next + DV_MILLI;
      end
    end
  endtask

  // A quarter period behind CLK0.
  always @(clk0) clk90 <= #(period / 4000.0) clk0;

  // Twice the input frequency: two pulses per input period.
  always @(posedge clk0)
    if (period > 0) begin
      clk2x = 1'b1;
      #(period / 4000.0) clk2x = 1'b0;
      #(period / 4000.0) clk2x = 1'b1;
      #(period / 4000.0) clk2x = 1'b0;
    end

  always @(fx_start)
    for (n = 0; n < CLKFX_MULTIPLY; n = n + 1) begin
      clkfx = 1'b1;
      #(period * CLKFX_DIVIDE / (2000.0 * CLKFX_MULTIPLY)) clkfx = 1'b0;
      // The last low phase ends with the next start.
      if (n < CLKFX_MULTIPLY - 1) #(period * CLKFX_DIVIDE / (2000.0 * CLKFX_MULTIPLY));
    end

  assign CLK0 = clk0;
  assign CLK180 = run & ~clk_in;
  assign CLK90 = run & clk90;
  assign CLK270 = run & ~clk90;
  assign CLK2X = run & clk2x;
  assign CLK2X180 = run & ~clk2x;
  assign CLKDV = run & locked & clkdv;
  assign CLKFX = run & locked & clkfx;
  assign LOCKED = run & locked;

  specify
    (CLKIN => CLK0) = (0, 0);
    (CLKIN => CLK90) = (0, 0);
    (CLKIN => CLK180) = (0, 0);
    (CLKIN => CLK270) = (0, 0);
    (CLKIN => CLK2X) = (0, 0);
    (CLKIN => CLK2X180) = (0, 0);
    (CLKIN => CLKDV) = (0, 0);
    (CLKIN => CLKFX) = (0, 0);
    (CLKIN => LOCKED) = (0, 0);
  endspecify
endmodule
