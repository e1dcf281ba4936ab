// Asynchronous resets of both polarities and reset values, a preset
// register, a register on the falling clock edge and a shift register.
module async_regs (
    input clk,
    input rst_n,
    input arst,
    input en,
    input [5:0] d,
    input serial_in,
    output reg [5:0] q_clear,
    output reg [5:0] q_mixed,
    output reg [3:0] q_fall,
    output reg [7:0] shift
);
  always @(posedge clk or negedge rst_n)
    if (!rst_n) q_clear <= 6'd0;
    else if (en) q_clear <= d;

  // Reset value with ones and zeros: preset and clear flops.
  always @(posedge clk or posedge arst)
    if (arst) q_mixed <= 6'b101100;
    else q_mixed <= q_mixed ^ d;

  always @(negedge clk or negedge rst_n)
    if (!rst_n) q_fall <= 4'hf;
    else q_fall <= d[3:0] + q_fall;

  always @(posedge clk or negedge rst_n)
    if (!rst_n) shift <= 8'h81;
    else if (en) shift <= {shift[6:0], serial_in ^ shift[7]};
endmodule
