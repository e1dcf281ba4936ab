// V_DCM: digital clock manager, functional view. Frequency synthesis has
// no functional equivalent: every output passes the input clock through,
// the 180-degree outputs inverted, and LOCKED is the inverse of RST.
module V_DCM (
    (* clkbuf_sink *) input CLKIN,
    input  CLKFB,
    input  RST,
    output CLK0,
    output CLK90,
    output CLK180,
    output CLK270,
    output CLK2X,
    output CLK2X180,
    output CLKDV,
    output CLKFX,
    output LOCKED
);
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

  assign CLK0 = CLKIN;
  assign CLK90 = CLKIN;
  assign CLK180 = ~CLKIN;
  assign CLK270 = ~CLKIN;
  assign CLK2X = CLKIN;
  assign CLK2X180 = ~CLKIN;
  assign CLKDV = CLKIN;
  assign CLKFX = CLKIN;
  assign LOCKED = ~RST;
endmodule
