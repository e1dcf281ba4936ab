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
  // The asynchronous inputs act on their level: preset rises also when GSR
  // falls while PRE is still 1, and the flop is preset at once.
  wire hold = gsr === 1'b1;
  wire preset = !hold && PRE === 1'b1;
  reg Q;
  reg notifier;

  // A timing violation toggles the notifier and, with XON "TRUE", makes the
  // state unknown (see V_FD).
  wire viol = (XON == "TRUE") ? notifier : 1'bx;
  reg viol_seen;

  initial Q = INIT;

  always @(posedge C or posedge hold or posedge preset or posedge viol or negedge viol)
    if (viol !== viol_seen) begin
      viol_seen = viol;
      Q <= 1'bx;
    end else if (hold) Q <= INIT;
    else if (preset) Q <= 1'b1;
    else if (CE === 1'b1) Q <= D;
    else if (CE !== 1'b0 && Q !== D) Q <= 1'bx;

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
