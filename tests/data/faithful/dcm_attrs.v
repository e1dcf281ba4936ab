// A clock manager whose integer and real attributes yosys writes as binary
// strings.
module top(input clk_in, input rst, output clk0, output clkfx);
  wire clk_bufg;
  V_CKBUF ck (.I(clk_in), .O(clk_bufg));
  V_DCM #(.CLKFX_DIVIDE(2), .CLKFX_MULTIPLY(5), .PHASE_SHIFT(-5), .CLKIN_PERIOD(20),
          .CLKDV_DIVIDE(3), .DSS_MODE("NONE"))
    dcm0 (.CLKIN(clk_bufg), .CLKFB(clk0), .RST(rst), .CLK0(clk0), .CLKFX(clkfx));
endmodule
