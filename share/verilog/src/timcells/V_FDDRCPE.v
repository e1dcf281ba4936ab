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
  // The asynchronous inputs act on their level: clear (preset) rises also
  // when a stronger one falls while CLR (PRE) is still 1.
  wire hold = gsr === 1'b1;
  wire clear = !hold && CLR === 1'b1;
  wire preset = !hold && !clear && PRE === 1'b1;
  reg Q;
  reg notifier;

  // A timing violation toggles the notifier and, with XON "TRUE", makes the
  // state unknown (see V_FD).
  wire viol = (XON == "TRUE") ? notifier : 1'bx;
  reg viol_seen;

  // The clocks as the state's block saw them last: it wakes on both edges
  // of each, so that it knows which one rose.
  reg c0_seen, c1_seen;
  reg c0_rose, c1_rose;

  initial Q = INIT;

  always @(posedge C0 or negedge C0 or posedge C1 or negedge C1 or posedge hold or posedge clear or
           posedge preset or posedge viol or negedge viol) begin
    c0_rose = C0 === 1'b1 && c0_seen !== 1'b1;
    c1_rose = C1 === 1'b1 && c1_seen !== 1'b1;
    c0_seen = C0;
    c1_seen = C1;
    if (viol !== viol_seen) begin
      viol_seen = viol;
      Q <= 1'bx;
    end else if (hold) Q <= INIT;
    else if (clear) Q <= 1'b0;
    else if (preset) Q <= 1'b1;
    else if (c0_rose) Q <= next(Q, D0);
    else if (c1_rose) Q <= next(Q, D1);
  end

  // The state after a clock edge with data d; an unknown enable makes it
  // unknown unless d is the state.
  function next;
    input q, d;
    if (CE === 1'b1) next = d;
    else if (CE !== 1'b0 && q !== d) next = 1'bx;
    else next = q;
  endfunction

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
