// A small accumulator CPU: 8 registers of 16 bits, an ALU, a program counter
// and a program memory interface. Used by the benchmarks as a real design
// that yosys synthesizes, replicated to reach a million cells.
module minicpu (
    input clk,
    input rst,
    input [15:0] instr,
    input [15:0] din,
    output reg [7:0] pc,
    output [15:0] dout,
    output reg we
);
    reg [15:0] regs [0:7];
    reg [15:0] acc;
    reg carry;
    wire [3:0] op = instr[15:12];
    wire [2:0] rs = instr[11:9];
    wire [8:0] imm = instr[8:0];
    wire [15:0] b = regs[rs];
    wire [16:0] sum = {1'b0, acc} + {1'b0, b} + carry;
    integer i;
    assign dout = acc;
    always @(posedge clk) begin
        if (rst) begin
            pc <= 8'd0;
            acc <= 16'd0;
            carry <= 1'b0;
            we <= 1'b0;
            for (i = 0; i < 8; i = i + 1) regs[i] <= 16'd0;
        end else begin
            pc <= pc + 8'd1;
            we <= 1'b0;
            case (op)
                4'h0: acc <= {7'd0, imm};
                4'h1: {carry, acc} <= sum;
                4'h2: acc <= acc - b;
                4'h3: acc <= acc & b;
                4'h4: acc <= acc | b;
                4'h5: acc <= acc ^ b;
                4'h6: acc <= {acc[14:0], carry};
                4'h7: acc <= {carry, acc[15:1]};
                4'h8: regs[rs] <= acc;
                4'h9: acc <= b;
                4'ha: acc <= din;
                4'hb: we <= 1'b1;
                4'hc: if (acc == 16'd0) pc <= imm[7:0];
                4'hd: if (carry) pc <= imm[7:0];
                4'he: pc <= imm[7:0];
                default: ;
            endcase
        end
    end
endmodule
