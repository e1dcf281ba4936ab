// Three levels of hierarchy for the multiple-hierarchy checks: module type
// stage is used twice, and Stage differs from it only in case.
module stage(input clk, input rst, input [1:0] d, output reg [1:0] q);
    always @(posedge clk)
        if (rst) q <= 2'd0;
        else q <= d + 2'd1;
endmodule

module Stage(input clk, input [1:0] d, output reg [1:0] q);
    always @(posedge clk) q <= ~d;
endmodule

module twist(input clk, input [1:0] d, output reg [1:0] q);
    always @(posedge clk) q <= d ^ {q[0], 1'b1};
endmodule

module pipe(input clk, input rst, input [1:0] d, output [1:0] q);
    wire [1:0] t;
    stage s0(.clk(clk), .rst(rst), .d(d), .q(t));
    stage s1(.clk(clk), .rst(rst), .d(t), .q(q));
endmodule

module hier3(input clk, input rst, input [1:0] d, output [1:0] q, output [1:0] r,
             output [1:0] u);
    pipe p(.clk(clk), .rst(rst), .d(d), .q(q));
    twist x(.clk(clk), .d(q), .q(r));
    Stage y(.clk(clk), .d(r), .q(u));
endmodule
