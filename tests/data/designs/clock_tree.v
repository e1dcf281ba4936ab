// nlw-test: no-proof (the clock manager has no functional equivalent)
// nlw-test: qdb2ver-only (yosys's JSON reader takes real parameters for strings)
//
// Library cells instantiated in the RTL: a clock manager with real, integer
// and string parameters, clock multiplexers of both select polarities, and
// a dual-rate output flop; counters on the manager's clocks.
module clock_tree (
    input clk_in,
    input rst,
    input sel,
    input [1:0] d,
    output locked,
    output clk_mux,
    output clk_mux_1,
    output [3:0] count0,
    output [3:0] count_dv,
    output ddr
);
  wire clk0, clkdv, clkfx;

  V_DCM #(
      .CLKDV_DIVIDE(2.5),
      .CLKFX_MULTIPLY(3),
      .CLKFX_DIVIDE(2),
      .CLK_FEEDBACK("1X"),
      .DUTY_CYCLE_CORRECTION("TRUE")
  ) dcm0 (
      .CLKIN(clk_in),
      .CLKFB(clk0),
      .RST(rst),
      .CLK0(clk0),
      .CLKDV(clkdv),
      .CLKFX(clkfx),
      .LOCKED(locked)
  );

  V_BUFGMUX mux (
      .I0(clkdv),
      .I1(clkfx),
      .S(sel),
      .O(clk_mux)
  );
  V_BUFGMUX_1 mux_1 (
      .I0(clkdv),
      .I1(clkfx),
      .S(sel),
      .O(clk_mux_1)
  );

  reg [3:0] c0 = 4'd0, cdv = 4'd0;
  always @(posedge clk0) c0 <= rst ? 4'd0 : c0 + 4'd1;
  always @(posedge clkdv) cdv <= cdv + 4'd1;
  assign count0 = c0;
  assign count_dv = cdv;

  V_FDDRCPE #(.INIT(1'b1)) oddr (
      .C0(clk0),
      .C1(~clk0),
      .CE(1'b1),
      .CLR(1'b0),
      .PRE(1'b0),
      .D0(d[0]),
      .D1(d[1]),
      .Q(ddr)
  );
endmodule
