// nlw-test: flow-options -keepbuses
// Hierarchy with buses in both directions: two counter instances with
// synchronous reset, enable and load, and a comparator module.
module counter_hier (
    input clk,
    input rst,
    input en,
    input load,
    input [7:0] load_value,
    input [3:0] step,
    output [7:0] count_a,
    output [7:0] count_b,
    output equal,
    output wrap
);
  counter8 u_a (
      .clk(clk),
      .rst(rst),
      .en(en),
      .load(load),
      .value(load_value),
      .step(step),
      .count(count_a),
      .wrap(wrap)
  );
  counter8 u_b (
      .clk(clk),
      .rst(rst),
      .en(~en),
      .load(1'b0),
      .value(8'h00),
      .step(4'd1),
      .count(count_b),
      .wrap()
  );
  compare8 u_cmp (
      .x(count_a),
      .y(count_b),
      .eq(equal)
  );
endmodule

module counter8 (
    input clk,
    input rst,
    input en,
    input load,
    input [7:0] value,
    input [3:0] step,
    output reg [7:0] count,
    output wrap
);
  assign wrap = en && (count + step < count);

  always @(posedge clk)
    if (rst) count <= 8'd0;
    else if (load) count <= value;
    else if (en) count <= count + step;
endmodule

module compare8 (
    input [7:0] x,
    input [7:0] y,
    output eq
);
  assign eq = x == y;
endmodule
