// A register bit yosys finds constant: its named net keeps the bit as "1".
// A kept bus whose bits other names carry: its net lists their bits.
module top(input clk, input a, input b, output [2:0] y, output x);
  reg [2:0] r = 3'b100;
  (* keep *) wire [2:0] w = {a, b, a & b};
  always @(posedge clk) r <= {r[2], a & b, a | b};
  assign y = r ^ {3{b}};
  assign x = w[2] ^ w[0];
endmodule
