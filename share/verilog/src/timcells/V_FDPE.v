// V_FDPE: D flip-flop on the rising edge of C with clock enable CE and
// asynchronous preset PRE. While the global set/reset chipwide.GSR is 1 the
// flop holds INIT; GSR takes precedence over PRE.
`timescale 1 ns/1 ps
module V_FDPE (C, CE, PRE, D, Q);
  parameter [0:0] INIT = 1'b1;
  parameter XON = "TRUE";
  parameter MSGON = "TRUE";
  input C, CE, PRE, D;
  output Q;

  wire gsr = chipwide.GSR;
  reg q_out;
  reg notifier;

  initial q_out = INIT;

  // The asynchronous inputs act on their level: when GSR falls while PRE is
  // still 1 the flop is preset at once.
  always @(gsr or PRE)
    if (gsr === 1'b1) q_out <= INIT;
    else if (PRE === 1'b1) q_out <= 1'b1;

  always @(posedge C)
    if (gsr !== 1'b1 && PRE !== 1'b1 && CE === 1'b1) q_out <= D;
    else if (gsr !== 1'b1 && PRE !== 1'b1 && CE !== 1'b0 && q_out !== D) q_out <= 1'bx;

  always @(notifier) if (XON == "TRUE") q_out <= 1'bx;

  assign Q = q_out;

  specify
    (posedge C => (Q +: D)) = (0, 0);
    (posedge PRE => (Q +: 1'b1)) = (0, 0);
    $setuphold(posedge C, D, 0, 0, notifier);
    $setuphold(posedge C, CE, 0, 0, notifier);
    $recrem(negedge PRE, posedge C, 0, 0, notifier);
    $width(posedge C, 0, 0, notifier);
    $width(negedge C, 0, 0, notifier);
    $width(posedge PRE, 0, 0, notifier);
  endspecify
endmodule
