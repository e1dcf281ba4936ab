// V_FDDRCPE: dual-rate D flip-flop. Q takes D0 on the rising edge of C0 and
// D1 on the rising edge of C1, both when the clock enable CE is 1. The
// asynchronous clear CLR takes precedence over the asynchronous preset PRE.
// While the global set/reset chipwide.GSR is 1 the flop holds INIT.
`timescale 1 ns/1 ps
module V_FDDRCPE (C0, C1, CE, CLR, PRE, D0, D1, Q);
  parameter [0:0] INIT = 1'b0;
  parameter XON = "TRUE";
  parameter MSGON = "TRUE";
  input C0, C1, CE, CLR, PRE, D0, D1;
  output Q;

  wire gsr = chipwide.GSR;
  wire async = gsr === 1'b1 || CLR === 1'b1 || PRE === 1'b1;
  reg q_out;
  reg notifier;

  initial q_out = INIT;

  always @(gsr or CLR or PRE)
    if (gsr === 1'b1) q_out <= INIT;
    else if (CLR === 1'b1) q_out <= 1'b0;
    else if (PRE === 1'b1) q_out <= 1'b1;

  always @(posedge C0)
    if (!async && CE === 1'b1) q_out <= D0;
    else if (!async && CE !== 1'b0 && q_out !== D0) q_out <= 1'bx;

  always @(posedge C1)
    if (!async && CE === 1'b1) q_out <= D1;
    else if (!async && CE !== 1'b0 && q_out !== D1) q_out <= 1'bx;

  always @(notifier) if (XON == "TRUE") q_out <= 1'bx;

  assign Q = q_out;

  specify
    (posedge C0 => (Q +: D0)) = (0, 0);
    (posedge C1 => (Q +: D1)) = (0, 0);
    (posedge CLR => (Q +: 1'b0)) = (0, 0);
    (posedge PRE => (Q +: 1'b1)) = (0, 0);
    $setuphold(posedge C0, D0, 0, 0, notifier);
    $setuphold(posedge C1, D1, 0, 0, notifier);
    $setuphold(posedge C0, CE, 0, 0, notifier);
    $setuphold(posedge C1, CE, 0, 0, notifier);
    $recrem(negedge CLR, posedge C0, 0, 0, notifier);
    $recrem(negedge CLR, posedge C1, 0, 0, notifier);
    $recrem(negedge PRE, posedge C0, 0, 0, notifier);
    $recrem(negedge PRE, posedge C1, 0, 0, notifier);
    $width(posedge CLR, 0, 0, notifier);
    $width(posedge PRE, 0, 0, notifier);
  endspecify
endmodule
