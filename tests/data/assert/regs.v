// Registers that yosys removes as constant (tie, mode: each holds its
// initial value) and merges (a and b in every instance of unit), for the
// design map and assertion file checks.
module unit(input clk, input [1:0] d, output [1:0] q);
    reg [1:0] a;
    reg [1:0] b;
    reg [1:0] tie = 2'b10;
    always @(posedge clk) begin
        a <= d;
        b <= d;
        tie <= {1'b1, tie[0]};
    end
    assign q = (a ^ {b[0], b[1]}) | tie;
endmodule
module regs(input clk, input rst, input [1:0] d, output [1:0] q, output [1:0] r, output [1:0] s);
    reg [1:0] mode = 2'b01;
    reg [2:0] cnt = 0;
    reg [2:0] cnt_copy = 0;
    always @(posedge clk) begin
        mode <= mode;
        if (rst) begin cnt <= 0; cnt_copy <= 0; end
        else begin cnt <= cnt + 1; cnt_copy <= cnt_copy + 1; end
    end
    unit u(.clk(clk), .d(d ^ mode), .q(q));
    assign r = cnt[1:0] ^ cnt_copy[2:1];
    unit v(.clk(clk), .d(d), .q(s));
endmodule
