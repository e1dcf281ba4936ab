`include "defs.vh"
module two(input a, output y);
  leaf u(.a(a), .y(y));
endmodule
