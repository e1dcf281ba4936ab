// Sequential with hierarchy: an enabled counter with asynchronous reset in a
// sub-module, a registered compare, a descending (upto) bus and a pass-through.
module step(input clk, input rst, input en, input [0:3] load, input ld, output reg [7:0] q);
  always @(posedge clk or posedge rst)
    if (rst) q <= 8'h00;
    else if (ld) q <= {4'b0, load};
    else if (en) q <= q + 1;
endmodule

module counter(input clk, input rst, input en, input [0:3] load, input ld,
               output [7:0] q, output reg hit, output pass);
  step u_step(.clk(clk), .rst(rst), .en(en), .load(load), .ld(ld), .q(q));
  always @(posedge clk) hit <= q == 8'h2a;
  assign pass = en;
endmodule
