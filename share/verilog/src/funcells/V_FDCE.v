// V_FDCE: D flip-flop on the rising edge of C with clock enable CE and
// asynchronous clear CLR, starting from INIT.
module V_FDCE (
    (* clkbuf_sink *) input C,
    input CE,
    input CLR,
    input D,
    output reg Q
);
  parameter [0:0] INIT = 1'b0;

  initial Q = INIT;

  always @(posedge C or posedge CLR)
    if (CLR) Q <= 1'b0;
    else if (CE) Q <= D;
endmodule
