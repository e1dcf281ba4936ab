// V_FDCE: D flip-flop on the rising edge of C with clock enable CE and
// asynchronous clear CLR. While the global set/reset chipwide.GSR is 1 the
// flop holds INIT; GSR takes precedence over CLR.
`timescale 1 ns/1 ps
module V_FDCE (C, CE, CLR, D, Q);
  parameter [0:0] INIT = 1'b0;
  parameter XON = "TRUE";
  parameter MSGON = "TRUE";
  input C, CE, CLR, D;
  output Q;

  wire gsr = chipwide.GSR;
  reg q_out;
  reg notifier;

  initial q_out = INIT;

  // The asynchronous inputs act on their level: when GSR falls while CLR is
  // still 1 the flop is cleared at once.
  always @(gsr or CLR)
    if (gsr === 1'b1) q_out <= INIT;
    else if (CLR === 1'b1) q_out <= 1'b0;

  always @(posedge C)
    if (gsr !== 1'b1 && CLR !== 1'b1 && CE === 1'b1) q_out <= D;
    else if (gsr !== 1'b1 && CLR !== 1'b1 && CE !== 1'b0 && q_out !== D) q_out <= 1'bx;

  always @(notifier) if (XON == "TRUE") q_out <= 1'bx;

  assign Q = q_out;

  specify
    (posedge C => (Q +: D)) = (0, 0);
    (posedge CLR => (Q +: 1'b0)) = (0, 0);
    $setuphold(posedge C, D, 0, 0, notifier);
    $setuphold(posedge C, CE, 0, 0, notifier);
    $recrem(negedge CLR, posedge C, 0, 0, notifier);
    $width(posedge C, 0, 0, notifier);
    $width(negedge C, 0, 0, notifier);
    $width(posedge CLR, 0, 0, notifier);
  endspecify
endmodule
