// V_INV: inverter, O = ~I.
module V_INV (
    input  I,
    output O
);
  assign O = ~I;
endmodule
