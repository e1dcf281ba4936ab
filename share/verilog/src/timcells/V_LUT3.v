// V_LUT3: 3-input lookup table. O is bit {I2, I1, I0} of INIT.
`timescale 1 ns/1 ps
// Simulators read the tables below; yosys and Verilator, which do not
// read table primitives, get the multiplexer chain instead, as does a
// simulation that defines CELLS_NO_UDP.
`ifndef CELLS_NO_UDP
`ifdef YOSYS
`define CELLS_NO_UDP
`elsif VERILATOR
`define CELLS_NO_UDP
`endif
`endif
`ifndef CELLS_NO_UDP
// V_LUT3_T3: O is D[{S2, S1, S0}]. An unknown select gives
// the value common to all the D bits it may select, and unknown when
// they differ: rows with x selects list those cases, and a table
// gives x where no row matches.
primitive V_LUT3_T3 (O, S0, S1, S2,
    D0, D1, D2, D3, D4, D5, D6, D7);
  output O;
  input S0, S1, S2;
  input D0, D1, D2, D3, D4, D5, D6, D7;
  table
    // S0 S1 S2   D0 .. D7 : O
    0  0  0   0 ? ? ? ? ? ? ? : 0;
    0  0  0   1 ? ? ? ? ? ? ? : 1;
    0  0  1   ? ? ? ? 0 ? ? ? : 0;
    0  0  1   ? ? ? ? 1 ? ? ? : 1;
    0  1  0   ? ? 0 ? ? ? ? ? : 0;
    0  1  0   ? ? 1 ? ? ? ? ? : 1;
    0  1  1   ? ? ? ? ? ? 0 ? : 0;
    0  1  1   ? ? ? ? ? ? 1 ? : 1;
    1  0  0   ? 0 ? ? ? ? ? ? : 0;
    1  0  0   ? 1 ? ? ? ? ? ? : 1;
    1  0  1   ? ? ? ? ? 0 ? ? : 0;
    1  0  1   ? ? ? ? ? 1 ? ? : 1;
    1  1  0   ? ? ? 0 ? ? ? ? : 0;
    1  1  0   ? ? ? 1 ? ? ? ? : 1;
    1  1  1   ? ? ? ? ? ? ? 0 : 0;
    1  1  1   ? ? ? ? ? ? ? 1 : 1;
    0  0  x   0 ? ? ? 0 ? ? ? : 0;
    0  0  x   1 ? ? ? 1 ? ? ? : 1;
    0  1  x   ? ? 0 ? ? ? 0 ? : 0;
    0  1  x   ? ? 1 ? ? ? 1 ? : 1;
    0  x  0   0 ? 0 ? ? ? ? ? : 0;
    0  x  0   1 ? 1 ? ? ? ? ? : 1;
    0  x  1   ? ? ? ? 0 ? 0 ? : 0;
    0  x  1   ? ? ? ? 1 ? 1 ? : 1;
    1  0  x   ? 0 ? ? ? 0 ? ? : 0;
    1  0  x   ? 1 ? ? ? 1 ? ? : 1;
    1  1  x   ? ? ? 0 ? ? ? 0 : 0;
    1  1  x   ? ? ? 1 ? ? ? 1 : 1;
    1  x  0   ? 0 ? 0 ? ? ? ? : 0;
    1  x  0   ? 1 ? 1 ? ? ? ? : 1;
    1  x  1   ? ? ? ? ? 0 ? 0 : 0;
    1  x  1   ? ? ? ? ? 1 ? 1 : 1;
    x  0  0   0 0 ? ? ? ? ? ? : 0;
    x  0  0   1 1 ? ? ? ? ? ? : 1;
    x  0  1   ? ? ? ? 0 0 ? ? : 0;
    x  0  1   ? ? ? ? 1 1 ? ? : 1;
    x  1  0   ? ? 0 0 ? ? ? ? : 0;
    x  1  0   ? ? 1 1 ? ? ? ? : 1;
    x  1  1   ? ? ? ? ? ? 0 0 : 0;
    x  1  1   ? ? ? ? ? ? 1 1 : 1;
    0  x  x   0 ? 0 ? 0 ? 0 ? : 0;
    0  x  x   1 ? 1 ? 1 ? 1 ? : 1;
    1  x  x   ? 0 ? 0 ? 0 ? 0 : 0;
    1  x  x   ? 1 ? 1 ? 1 ? 1 : 1;
    x  0  x   0 0 ? ? 0 0 ? ? : 0;
    x  0  x   1 1 ? ? 1 1 ? ? : 1;
    x  1  x   ? ? 0 0 ? ? 0 0 : 0;
    x  1  x   ? ? 1 1 ? ? 1 1 : 1;
    x  x  0   0 0 0 0 ? ? ? ? : 0;
    x  x  0   1 1 1 1 ? ? ? ? : 1;
    x  x  1   ? ? ? ? 0 0 0 0 : 0;
    x  x  1   ? ? ? ? 1 1 1 1 : 1;
    x  x  x   0 0 0 0 0 0 0 0 : 0;
    x  x  x   1 1 1 1 1 1 1 1 : 1;
  endtable
endprimitive
`endif
module V_LUT3 (I0, I1, I2, O);
  parameter [7:0] INIT = 8'h00;
  input I0, I1, I2;
  output O;

`ifdef CELLS_NO_UDP
  // A chain of multiplexers, one input at a time from the highest: each
  // stage keeps the half of the table its input selects. An unknown input
  // keeps the bits where both halves agree and makes the others unknown
  // (the rule of the conditional operator), exactly as the tables do.
  wire [3:0] t2 = I2 ? INIT[7:4] : INIT[3:0];
  wire [1:0] t1 = I1 ? t2[3:2] : t2[1:0];
  assign O = I0 ? t1[1] : t1[0];
`else
  V_LUT3_T3 q (O, I0, I1, I2,
      INIT[0], INIT[1], INIT[2], INIT[3], INIT[4], INIT[5], INIT[6], INIT[7]);
`endif

  specify
    (I0 => O) = (0, 0);
    (I1 => O) = (0, 0);
    (I2 => O) = (0, 0);
  endspecify
endmodule
