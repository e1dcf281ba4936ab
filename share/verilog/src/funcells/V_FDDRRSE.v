// V_FDDRRSE: dual-rate D flip-flop with clock enable and synchronous reset
// (before set) and set, starting from INIT. Each clock has its own register;
// Q shows the C0 register while C0 is 1 and the C1 register while it is 0,
// and a register whose clock edge comes with CE 0 takes the other one's
// value, which is the dual-rate behaviour when C1 is the inverse of C0.
module V_FDDRRSE (
    (* clkbuf_sink *) input C0,
    (* clkbuf_sink *) input C1,
    input CE,
    input R,
    input S,
    input D0,
    input D1,
    output Q
);
  parameter [0:0] INIT = 1'b0;

  reg q0, q1;

  initial begin
    q0 = INIT;
    q1 = INIT;
  end

  always @(posedge C0)
    if (R) q0 <= 1'b0;
    else if (S) q0 <= 1'b1;
    else q0 <= CE ? D0 : q1;

  always @(posedge C1)
    if (R) q1 <= 1'b0;
    else if (S) q1 <= 1'b1;
    else q1 <= CE ? D1 : q0;

  assign Q = C0 ? q0 : q1;
endmodule
