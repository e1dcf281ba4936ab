// nlw-test: flow-options -lut 4
//
// A state machine driving two instances of a parameterized module (two
// derived module types), flops with synchronous set, and a small register
// file that yosys turns into flops and multiplexers. Mapped onto lookup
// tables of at most four inputs.
module fsm_param (
    input clk,
    input reset,
    input start,
    input [3:0] data,
    input [2:0] waddr,
    input [2:0] raddr,
    input we,
    output reg [1:0] state,
    output busy,
    output [3:0] acc_small,
    output [5:0] acc_large,
    output [3:0] rdata
);
  localparam IDLE = 2'd0, RUN = 2'd1, HOLD = 2'd2, DONE = 2'd3;

  always @(posedge clk)
    if (reset) state <= IDLE;
    else
      case (state)
        IDLE: if (start) state <= RUN;
        RUN: state <= data[0] ? HOLD : RUN;
        HOLD: state <= data[1] ? DONE : RUN;
        default: state <= IDLE;
      endcase

  assign busy = state == RUN || state == HOLD;

  accum #(.W(4), .SET(4'b1001)) u_small (
      .clk(clk),
      .set(reset),
      .en(busy),
      .d(data),
      .acc(acc_small)
  );
  accum #(.W(6), .SET(6'b000111)) u_large (
      .clk(clk),
      .set(reset),
      .en(state == DONE),
      .d({2'b01, data}),
      .acc(acc_large)
  );

  reg [3:0] regs[0:7];
  integer i;
  initial for (i = 0; i < 8; i = i + 1) regs[i] = i;
  always @(posedge clk) if (we) regs[waddr] <= data;
  assign rdata = regs[raddr];
endmodule

module accum #(
    parameter W = 4,
    parameter [W-1:0] SET = 0
) (
    input clk,
    input set,
    input en,
    input [W-1:0] d,
    output reg [W-1:0] acc
);
  always @(posedge clk)
    if (set) acc <= SET;
    else if (en) acc <= acc + d;
endmodule
