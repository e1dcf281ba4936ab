// V_FD: D flip-flop on the rising edge of C, starting from INIT.
module V_FD (
    (* clkbuf_sink *) input C,
    input D,
    output reg Q
);
  parameter [0:0] INIT = 1'b0;

  initial Q = INIT;

  always @(posedge C) Q <= D;
endmodule
