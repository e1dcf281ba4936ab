// Combinational logic only: an 8-bit ALU with flags, a 4 x 4 multiplier,
// a wide function of six inputs, and output bits tied to constants.
module comb_alu (
    input [7:0] a,
    input [7:0] b,
    input [2:0] op,
    input cin,
    output reg [7:0] y,
    output zero,
    output carry,
    output [7:0] product,
    output parity6,
    output [3:0] version
);
  reg c;

  always @* begin
    c = 1'b0;
    case (op)
      3'd0: {c, y} = a + b + cin;
      3'd1: {c, y} = a - b;
      3'd2: y = a & b;
      3'd3: y = a | b;
      3'd4: y = a ^ b;
      3'd5: y = {a[6:0], a[7]};
      3'd6: y = (a < b) ? a : b;
      default: y = ~a;
    endcase
  end

  assign zero = (y == 8'd0);
  assign carry = c;
  assign product = a[3:0] * b[3:0];
  assign parity6 = ^{a[5:3], b[2:0]} | (a[7] & b[7]);
  assign version = 4'b1010;
endmodule
