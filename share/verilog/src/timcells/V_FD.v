// V_FD: D flip-flop on the rising edge of C.
// While the global set/reset chipwide.GSR is 1 the flop holds INIT.
`timescale 1 ns/1 ps
module V_FD (C, D, Q);
  parameter [0:0] INIT = 1'b0;
  parameter XON = "TRUE";
  parameter MSGON = "TRUE";
  input C, D;
  output Q;

  wire gsr = chipwide.GSR;
  wire hold = gsr === 1'b1;
  reg Q;
  reg notifier;

  // A timing violation toggles the notifier and, with XON "TRUE", makes the
  // state unknown: both edges of viol wake the state's block, which tells
  // them from its other events by the value it saw last. With XON "FALSE"
  // viol stays unknown and never wakes it.
  wire viol = (XON == "TRUE") ? notifier : 1'bx;
  reg viol_seen;

  initial Q = INIT;

  // One block owns the state: every event that changes it is an edge in
  // this list.
  always @(posedge C or posedge hold or posedge viol or negedge viol)
    if (viol !== viol_seen) begin
      viol_seen = viol;
      Q <= 1'bx;
    end else if (hold) Q <= INIT;
    else Q <= D;

  specify
    (posedge C => (Q +: D)) = (0, 0);
    $setuphold(posedge C, D, 0, 0, notifier);
    $width(posedge C, 0, 0, notifier);
    $width(negedge C, 0, 0, notifier);
  endspecify
endmodule
