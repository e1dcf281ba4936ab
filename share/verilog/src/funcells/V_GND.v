// V_GND: constant 0 on G.
module V_GND (
    output G
);
  assign G = 1'b0;
endmodule
