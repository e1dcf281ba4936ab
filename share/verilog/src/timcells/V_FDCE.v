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
  // The asynchronous inputs act on their level: clear rises also when GSR
  // falls while CLR is still 1, and the flop is cleared at once.
  wire hold = gsr === 1'b1;
  wire clear = !hold && CLR === 1'b1;
  reg Q;
  reg notifier;

  // A timing violation toggles the notifier and, with XON "TRUE", makes the
  // state unknown (see V_FD).
  wire viol = (XON == "TRUE") ? notifier : 1'bx;
  reg viol_seen;

  initial Q = INIT;

  always @(posedge C or posedge hold or posedge clear or posedge viol or negedge viol)
    if (viol !== viol_seen) begin
      viol_seen = viol;
      Q <= 1'bx;
    end else if (hold) Q <= INIT;
    else if (clear) Q <= 1'b0;
    else if (CE === 1'b1) Q <= D;
    else if (CE !== 1'b0 && Q !== D) Q <= 1'bx;

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
