// nlw-test: param W=8
// nlw-test: pins cpu_bus.pins
//
// A small CPU-like core: a register file the RTL leaves uninitialised, an
// ALU with flags, and a bus interface with a load that waits for the bus.
// The data width is a parameter that the flow overrides (-P W=8), and the
// pin constraints put pads on some of the ports.
module cpu_bus #(
    parameter W = 16,
    parameter NREG = 8
) (
    input clk,
    input rst_n,
    input [15:0] instr,
    input [W-1:0] bus_rdata,
    input bus_ready,
    output [W-1:0] bus_addr,
    output [W-1:0] bus_wdata,
    output bus_we,
    output bus_re,
    output reg [W-1:0] result,
    output reg zero,
    output reg carry
);
  localparam A = $clog2(NREG);

  // Instruction: op[15:12], rd[11:9], ra[8:6], rb[5:3]; the immediate is
  // the low six bits, sign-extended.
  wire [3:0] op = instr[15:12];
  wire [A-1:0] rd = instr[9+:A];
  wire [A-1:0] ra = instr[6+:A];
  wire [A-1:0] rb = instr[3+:A];
  wire [W-1:0] imm = {{(W - 6) {instr[5]}}, instr[5:0]};

  localparam OP_LD = 4'd9, OP_ST = 4'd10, OP_CMP = 4'd11;

  wire [W-1:0] a, b, d;
  wire [W-1:0] y;
  wire y_carry;
  wire load = op == OP_LD;
  wire stall = load && !bus_ready;
  wire writes = op <= OP_LD && !stall;

  cpu_regfile #(.W(W), .N(NREG)) regs (
      .clk(clk),
      .we(writes),
      .waddr(rd),
      .wdata(load ? bus_rdata : y),
      .raddr_a(ra),
      .raddr_b(rb),
      .raddr_d(rd),
      .a(a),
      .b(b),
      .d(d)
  );

  cpu_alu #(.W(W)) alu (
      .op(op),
      .a(a),
      .b(b),
      .imm(imm),
      .carry_in(carry),
      .y(y),
      .carry_out(y_carry)
  );

  cpu_bus_if #(.W(W)) bus (
      .load(load),
      .store(op == OP_ST),
      .base(a),
      .offset(imm),
      .data(d),
      .addr(bus_addr),
      .wdata(bus_wdata),
      .we(bus_we),
      .re(bus_re)
  );

  always @(posedge clk or negedge rst_n)
    if (!rst_n) begin
      result <= {W{1'b0}};
      zero <= 1'b0;
      carry <= 1'b0;
    end else if (!stall && (op <= 4'd8 || op == OP_CMP)) begin
      result <= y;
      zero <= y == {W{1'b0}};
      carry <= y_carry;
    end
endmodule

// Registers without reset: two read ports for the operands, one for the
// store data, one write port.
module cpu_regfile #(
    parameter W = 8,
    parameter N = 8
) (
    input clk,
    input we,
    input [$clog2(N)-1:0] waddr,
    input [W-1:0] wdata,
    input [$clog2(N)-1:0] raddr_a,
    input [$clog2(N)-1:0] raddr_b,
    input [$clog2(N)-1:0] raddr_d,
    output [W-1:0] a,
    output [W-1:0] b,
    output [W-1:0] d
);
  reg [W-1:0] r[0:N-1];

  always @(posedge clk) if (we) r[waddr] <= wdata;

  assign a = r[raddr_a];
  assign b = r[raddr_b];
  assign d = r[raddr_d];
endmodule

module cpu_alu #(
    parameter W = 8
) (
    input [3:0] op,
    input [W-1:0] a,
    input [W-1:0] b,
    input [W-1:0] imm,
    input carry_in,
    output reg [W-1:0] y,
    output reg carry_out
);
  always @* begin
    carry_out = carry_in;
    case (op)
      4'd0: {carry_out, y} = {1'b0, a} + {1'b0, b};
      4'd1: {carry_out, y} = {1'b0, a} - {1'b0, b};
      4'd2: y = a & b;
      4'd3: y = a | b;
      4'd4: y = a ^ b;
      4'd5: {carry_out, y} = {a, 1'b0};
      4'd6: {y, carry_out} = {carry_in, a};
      4'd7: {carry_out, y} = {1'b0, a} + {1'b0, imm};
      4'd8: y = imm;
      4'd11: {carry_out, y} = {1'b0, a} - {1'b0, b};
      default: y = a;
    endcase
  end
endmodule

// The bus: the address is base plus offset; stores drive the data.
module cpu_bus_if #(
    parameter W = 8
) (
    input load,
    input store,
    input [W-1:0] base,
    input [W-1:0] offset,
    input [W-1:0] data,
    output [W-1:0] addr,
    output [W-1:0] wdata,
    output we,
    output re
);
  assign addr = (load || store) ? base + offset : {W{1'b0}};
  assign wdata = store ? data : {W{1'b0}};
  assign we = store;
  assign re = load;
endmodule
