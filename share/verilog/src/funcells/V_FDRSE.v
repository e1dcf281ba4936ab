// V_FDRSE: D flip-flop on the rising edge of C with clock enable CE,
// synchronous reset R and synchronous set S (R before S, both whatever CE
// is), starting from INIT.
module V_FDRSE (
    (* clkbuf_sink *) input C,
    input CE,
    input R,
    input S,
    input D,
    output reg Q
);
  parameter [0:0] INIT = 1'b0;

  initial Q = INIT;

  always @(posedge C)
    if (R) Q <= 1'b0;
    else if (S) Q <= 1'b1;
    else if (CE) Q <= D;
endmodule
