// V_FDPE: D flip-flop on the rising edge of C with clock enable CE and
// asynchronous preset PRE, starting from INIT.
module V_FDPE (
    (* clkbuf_sink *) input C,
    input CE,
    input PRE,
    input D,
    output reg Q
);
  parameter [0:0] INIT = 1'b1;

  initial Q = INIT;

  always @(posedge C or posedge PRE)
    if (PRE) Q <= 1'b1;
    else if (CE) Q <= D;
endmodule
