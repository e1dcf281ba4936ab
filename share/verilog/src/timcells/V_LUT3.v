// V_LUT3: 3-input lookup table. O is bit {I2, I1, I0} of INIT.
`timescale 1 ns/1 ps
module V_LUT3 (I0, I1, I2, O);
  parameter [7:0] INIT = 8'h00;
  input I0, I1, I2;
  output O;
  reg O;

  // Known inputs index INIT directly; only a select with an unknown bit
  // takes the careful function. A procedural block, because simulators
  // evaluate both arms of a conditional operator in a continuous
  // assignment, which would make every evaluation the slow one.
  always @(I0 or I1 or I2)
    if (^{I2, I1, I0} === 1'bx) O = lut(INIT, {I2, I1, I0});
    else O = INIT[{I2, I1, I0}];

  // Selects input by input, so that an unknown input makes the output
  // unknown only where the entries it chooses between differ.
  function lut;
    input [7:0] init;
    input [2:0] s;
    reg [7:0] t;
    integer k;
    begin
      t = init;
      for (k = 0; k < 4; k = k + 1) t[k] = choose(t[2 * k], t[2 * k + 1], s[0]);
      for (k = 0; k < 2; k = k + 1) t[k] = choose(t[2 * k], t[2 * k + 1], s[1]);
      for (k = 0; k < 1; k = k + 1) t[k] = choose(t[2 * k], t[2 * k + 1], s[2]);
      lut = t[0];
    end
  endfunction

  function choose;
    input a, b, s;
    choose = (s === 1'b0) ? a : (s === 1'b1) ? b : (a === b) ? a : 1'bx;
  endfunction

  specify
    (I0 => O) = (0, 0);
    (I1 => O) = (0, 0);
    (I2 => O) = (0, 0);
  endspecify
endmodule
