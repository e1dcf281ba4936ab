// V_FD: D flip-flop on the rising edge of C.
// While the global set/reset chipwide.GSR is 1 the flop holds INIT.
`timescale 1 ns/1 ps
// Simulators read the tables below; yosys and Verilator, which do not
// read table primitives, get the always block instead, as does a
// simulation that defines CELLS_NO_UDP.
`ifndef CELLS_NO_UDP
`ifdef YOSYS
`define CELLS_NO_UDP
`elsif VERILATOR
`define CELLS_NO_UDP
`endif
`endif
`ifndef CELLS_NO_UDP
// V_FD_0 and V_FD_1: the state as a table, starting from INIT 0 or 1.
// Each row acts on one edge, like the always block of the plain model
// below: p is a rising and n a falling edge, * any change, - keeps the
// state; a table gives x where no row matches.
primitive V_FD_0 (Q, C, D, H, V);
  output Q;
  reg Q;
  input C, D, H, V;
  initial Q = 1'b0;
  table
    // C    D    H    V : Q : Q+
       p    ?    1    ? : ? : 0;
       p    0    0    ? : ? : 0;
       p    1    0    ? : ? : 1;
       n    ?    ?    ? : ? : -;
       ?    *    ?    ? : ? : -;
       ?    ? (01)    ? : ? : 0;
       ?    ? (x1)    ? : ? : 0;
       ?    ? (10)    ? : ? : -;
       ?    ? (x0)    ? : ? : -;
       ?    ? (0x)    ? : ? : -;
       ?    ? (1x)    ? : ? : -;
       ?    ?    ?    * : ? : x;
  endtable
endprimitive
primitive V_FD_1 (Q, C, D, H, V);
  output Q;
  reg Q;
  input C, D, H, V;
  initial Q = 1'b1;
  table
    // C    D    H    V : Q : Q+
       p    ?    1    ? : ? : 1;
       p    0    0    ? : ? : 0;
       p    1    0    ? : ? : 1;
       n    ?    ?    ? : ? : -;
       ?    *    ?    ? : ? : -;
       ?    ? (01)    ? : ? : 1;
       ?    ? (x1)    ? : ? : 1;
       ?    ? (10)    ? : ? : -;
       ?    ? (x0)    ? : ? : -;
       ?    ? (0x)    ? : ? : -;
       ?    ? (1x)    ? : ? : -;
       ?    ?    ?    * : ? : x;
  endtable
endprimitive
`endif
module V_FD (C, D, Q);
  parameter [0:0] INIT = 1'b0;
  parameter XON = "TRUE";
  parameter MSGON = "TRUE";
  input C, D;
  output Q;

  wire gsr = chipwide.GSR;
  wire hold = gsr === 1'b1;
  reg notifier;

  // A timing violation toggles the notifier and, with XON "TRUE", makes the
  // state unknown: both edges of viol wake the state's block, which tells
  // them from its other events by the value it saw last. With XON "FALSE"
  // viol stays unknown and never wakes it.
  wire viol = (XON == "TRUE") ? notifier : 1'bx;
`ifdef CELLS_NO_UDP
  reg Q;
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

`else
  generate
    if (INIT) V_FD_1 s (Q, C, D, hold, viol);
    else V_FD_0 s (Q, C, D, hold, viol);
  endgenerate
`endif

  specify
    (posedge C => (Q +: D)) = (0, 0);
    $setuphold(posedge C, D, 0, 0, notifier);
    $width(posedge C, 0, 0, notifier);
    $width(negedge C, 0, 0, notifier);
  endspecify
endmodule
