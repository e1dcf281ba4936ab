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
  reg q_out;
  reg notifier;

  initial q_out = INIT;

  always @(posedge gsr) q_out <= INIT;
  always @(posedge C) if (gsr !== 1'b1) q_out <= D;

  // A timing violation makes the state unknown when XON is "TRUE".
  always @(notifier) if (XON == "TRUE") q_out <= 1'bx;

  assign Q = q_out;

  specify
    (posedge C => (Q +: D)) = (0, 0);
    $setuphold(posedge C, D, 0, 0, notifier);
    $width(posedge C, 0, 0, notifier);
    $width(negedge C, 0, 0, notifier);
  endspecify
endmodule
