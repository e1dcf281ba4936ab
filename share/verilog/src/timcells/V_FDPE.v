// V_FDPE: D flip-flop on the rising edge of C with clock enable CE and
// asynchronous preset PRE. While the global set/reset chipwide.GSR is 1 the
// flop holds INIT; GSR takes precedence over PRE.
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
// V_FDPE_0 and V_FDPE_1: the state as a table, starting from INIT 0 or 1.
// Each row acts on one edge, like the always block of the plain model
// below: p is a rising and n a falling edge, * any change, - keeps the
// state; a table gives x where no row matches.
primitive V_FDPE_0 (Q, C, CE, D, H, K, V);
  output Q;
  reg Q;
  input C, CE, D, H, K, V;
  initial Q = 1'b0;
  table
    // C   CE    D    H    K    V : Q : Q+
       p    ?    ?    1    ?    ? : ? : 0;
       p    ?    ?    0    1    ? : ? : 1;
       p    1    0    0    0    ? : ? : 0;
       p    1    1    0    0    ? : ? : 1;
       p    0    ?    0    0    ? : ? : -;
       p    x    0    0    0    ? : 0 : 0;
       p    x    1    0    0    ? : 1 : 1;
       n    ?    ?    ?    ?    ? : ? : -;
       ?    *    ?    ?    ?    ? : ? : -;
       ?    ?    *    ?    ?    ? : ? : -;
       ?    ?    ? (01)    ?    ? : ? : 0;
       ?    ?    ? (x1)    ?    ? : ? : 0;
       ?    ?    ? (10)    ?    ? : ? : -;
       ?    ?    ? (x0)    ?    ? : ? : -;
       ?    ?    ? (0x)    ?    ? : ? : -;
       ?    ?    ? (1x)    ?    ? : ? : -;
       ?    ?    ?    ? (01)    ? : ? : 1;
       ?    ?    ?    ? (x1)    ? : ? : 1;
       ?    ?    ?    ? (10)    ? : ? : -;
       ?    ?    ?    ? (x0)    ? : ? : -;
       ?    ?    ?    ? (0x)    ? : ? : -;
       ?    ?    ?    ? (1x)    ? : ? : -;
       ?    ?    ?    ?    ?    * : ? : x;
  endtable
endprimitive
primitive V_FDPE_1 (Q, C, CE, D, H, K, V);
  output Q;
  reg Q;
  input C, CE, D, H, K, V;
  initial Q = 1'b1;
  table
    // C   CE    D    H    K    V : Q : Q+
       p    ?    ?    1    ?    ? : ? : 1;
       p    ?    ?    0    1    ? : ? : 1;
       p    1    0    0    0    ? : ? : 0;
       p    1    1    0    0    ? : ? : 1;
       p    0    ?    0    0    ? : ? : -;
       p    x    0    0    0    ? : 0 : 0;
       p    x    1    0    0    ? : 1 : 1;
       n    ?    ?    ?    ?    ? : ? : -;
       ?    *    ?    ?    ?    ? : ? : -;
       ?    ?    *    ?    ?    ? : ? : -;
       ?    ?    ? (01)    ?    ? : ? : 1;
       ?    ?    ? (x1)    ?    ? : ? : 1;
       ?    ?    ? (10)    ?    ? : ? : -;
       ?    ?    ? (x0)    ?    ? : ? : -;
       ?    ?    ? (0x)    ?    ? : ? : -;
       ?    ?    ? (1x)    ?    ? : ? : -;
       ?    ?    ?    ? (01)    ? : ? : 1;
       ?    ?    ?    ? (x1)    ? : ? : 1;
       ?    ?    ?    ? (10)    ? : ? : -;
       ?    ?    ?    ? (x0)    ? : ? : -;
       ?    ?    ?    ? (0x)    ? : ? : -;
       ?    ?    ?    ? (1x)    ? : ? : -;
       ?    ?    ?    ?    ?    * : ? : x;
  endtable
endprimitive
`endif
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
  reg notifier;

  // A timing violation toggles the notifier and, with XON "TRUE", makes the
  // state unknown (see V_FD).
  wire viol = (XON == "TRUE") ? notifier : 1'bx;
`ifdef CELLS_NO_UDP
  reg Q;
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

`else
  generate
    if (INIT) V_FDPE_1 s (Q, C, CE, D, hold, preset, viol);
    else V_FDPE_0 s (Q, C, CE, D, hold, preset, viol);
  endgenerate
`endif

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
