`include "defs.vh"
module leaf(input a, output y);
  assign y = `INV a;
endmodule
