// V_FDRSE: D flip-flop on the rising edge of C with clock enable CE,
// synchronous reset R and synchronous set S. R takes precedence over S, and
// both act whatever CE is. While the global set/reset chipwide.GSR is 1 the
// flop holds INIT.
`timescale 1 ns/1 ps
module V_FDRSE (C, CE, R, S, D, Q);
  parameter [0:0] INIT = 1'b0;
  parameter XON = "TRUE";
  parameter MSGON = "TRUE";
  input C, CE, R, S, D;
  output Q;

  wire gsr = chipwide.GSR;
  wire hold = gsr === 1'b1;
  reg Q;
  reg notifier;

  // A timing violation toggles the notifier and, with XON "TRUE", makes the
  // state unknown (see V_FD).
  wire viol = (XON == "TRUE") ? notifier : 1'bx;
  reg viol_seen;

  initial Q = INIT;

  always @(posedge C or posedge hold or posedge viol or negedge viol)
    if (viol !== viol_seen) begin
      viol_seen = viol;
      Q <= 1'bx;
    end else if (hold) Q <= INIT;
    else Q <= next(Q, D);

  // The state after a clock edge with data d; an unknown control makes it
  // unknown.
  function next;
    input q, d;
    if (R === 1'b1) next = 1'b0;
    else if (R !== 1'b0) next = 1'bx;
    else if (S === 1'b1) next = 1'b1;
    else if (S !== 1'b0) next = 1'bx;
    else if (CE === 1'b1) next = d;
    else if (CE !== 1'b0 && q !== d) next = 1'bx;
    else next = q;
  endfunction

  specify
    (posedge C => (Q +: D)) = (0, 0);
    $setuphold(posedge C, D, 0, 0, notifier);
    $setuphold(posedge C, CE, 0, 0, notifier);
    $setuphold(posedge C, R, 0, 0, notifier);
    $setuphold(posedge C, S, 0, 0, notifier);
    $width(posedge C, 0, 0, notifier);
    $width(negedge C, 0, 0, notifier);
  endspecify
endmodule
