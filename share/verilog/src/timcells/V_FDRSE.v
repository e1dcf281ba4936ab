// V_FDRSE: D flip-flop on the rising edge of C with clock enable CE,
// synchronous reset R and synchronous set S. R takes precedence over S, and
// both act whatever CE is. While the global set/reset chipwide.GSR is 1 the
// flop holds INIT.
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
// V_FDRSE_0 and V_FDRSE_1: the state as a table, starting from INIT 0 or 1.
// Each row acts on one edge, like the always block of the plain model
// below: p is a rising and n a falling edge, * any change, - keeps the
// state; a table gives x where no row matches.
primitive V_FDRSE_0 (Q, C, CE, D, R, S, H, V);
  output Q;
  reg Q;
  input C, CE, D, R, S, H, V;
  initial Q = 1'b0;
  table
    // C   CE    D    R    S    H    V : Q : Q+
       p    ?    ?    ?    ?    1    ? : ? : 0;
       p    ?    ?    1    ?    0    ? : ? : 0;
       p    ?    ?    0    1    0    ? : ? : 1;
       p    1    0    0    0    0    ? : ? : 0;
       p    1    1    0    0    0    ? : ? : 1;
       p    0    ?    0    0    0    ? : ? : -;
       p    x    0    0    0    0    ? : 0 : 0;
       p    x    1    0    0    0    ? : 1 : 1;
       n    ?    ?    ?    ?    ?    ? : ? : -;
       ?    *    ?    ?    ?    ?    ? : ? : -;
       ?    ?    *    ?    ?    ?    ? : ? : -;
       ?    ?    ?    *    ?    ?    ? : ? : -;
       ?    ?    ?    ?    *    ?    ? : ? : -;
       ?    ?    ?    ?    ? (01)    ? : ? : 0;
       ?    ?    ?    ?    ? (x1)    ? : ? : 0;
       ?    ?    ?    ?    ? (10)    ? : ? : -;
       ?    ?    ?    ?    ? (x0)    ? : ? : -;
       ?    ?    ?    ?    ? (0x)    ? : ? : -;
       ?    ?    ?    ?    ? (1x)    ? : ? : -;
       ?    ?    ?    ?    ?    ?    * : ? : x;
  endtable
endprimitive
primitive V_FDRSE_1 (Q, C, CE, D, R, S, H, V);
  output Q;
  reg Q;
  input C, CE, D, R, S, H, V;
  initial Q = 1'b1;
  table
    // C   CE    D    R    S    H    V : Q : Q+
       p    ?    ?    ?    ?    1    ? : ? : 1;
       p    ?    ?    1    ?    0    ? : ? : 0;
       p    ?    ?    0    1    0    ? : ? : 1;
       p    1    0    0    0    0    ? : ? : 0;
       p    1    1    0    0    0    ? : ? : 1;
       p    0    ?    0    0    0    ? : ? : -;
       p    x    0    0    0    0    ? : 0 : 0;
       p    x    1    0    0    0    ? : 1 : 1;
       n    ?    ?    ?    ?    ?    ? : ? : -;
       ?    *    ?    ?    ?    ?    ? : ? : -;
       ?    ?    *    ?    ?    ?    ? : ? : -;
       ?    ?    ?    *    ?    ?    ? : ? : -;
       ?    ?    ?    ?    *    ?    ? : ? : -;
       ?    ?    ?    ?    ? (01)    ? : ? : 1;
       ?    ?    ?    ?    ? (x1)    ? : ? : 1;
       ?    ?    ?    ?    ? (10)    ? : ? : -;
       ?    ?    ?    ?    ? (x0)    ? : ? : -;
       ?    ?    ?    ?    ? (0x)    ? : ? : -;
       ?    ?    ?    ?    ? (1x)    ? : ? : -;
       ?    ?    ?    ?    ?    ?    * : ? : x;
  endtable
endprimitive
`endif
module V_FDRSE (C, CE, R, S, D, Q);
  parameter [0:0] INIT = 1'b0;
  parameter XON = "TRUE";
  parameter MSGON = "TRUE";
  input C, CE, R, S, D;
  output Q;

  wire gsr = chipwide.GSR;
  wire hold = gsr === 1'b1;
  reg notifier;

  // A timing violation toggles the notifier and, with XON "TRUE", makes the
  // state unknown (see V_FD).
  wire viol = (XON == "TRUE") ? notifier : 1'bx;
`ifdef CELLS_NO_UDP
  reg Q;
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

`else
  generate
    if (INIT) V_FDRSE_1 s (Q, C, CE, D, R, S, hold, viol);
    else V_FDRSE_0 s (Q, C, CE, D, R, S, hold, viol);
  endgenerate
`endif

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
