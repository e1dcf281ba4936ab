// A kept submodule whose output buses are used in part or not at all, and
// constant output bits of the top.
(* keep_hierarchy *)
module sub(input [3:0] a, output [3:0] y, output [3:0] z);
  assign y = ~a;
  assign z = a ^ 4'h5;
endmodule

module top(input [3:0] a, input b, output [1:0] o, output [3:0] k);
  wire [3:0] y, z;
  sub u(.a(a), .y(y), .z(z));
  assign o = y[1:0];
  assign k = {b, 1'b0, a[1], 1'b1};
endmodule
