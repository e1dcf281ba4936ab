// counter: an 8-bit counter with synchronous reset, enable and load, whose
// low digit drives a seven-segment decoder in a sub-module.
module counter (
    input clk,
    input rst,
    input en,
    input load,
    input [7:0] din,
    output [7:0] count,
    output [6:0] segments,
    output tick
);
  reg [7:0] value;

  always @(posedge clk)
    if (rst) value <= 8'd0;
    else if (load) value <= din;
    else if (en) value <= value + 8'd1;

  assign count = value;
  assign tick = en && value == 8'hff;

  seg7 u_seg (
      .digit(value[3:0]),
      .segments(segments)
  );
endmodule

// Segments gfedcba of a common-cathode display for a hexadecimal digit.
module seg7 (
    input [3:0] digit,
    output reg [6:0] segments
);
  always @*
    case (digit)
      4'h0: segments = 7'b0111111;
      4'h1: segments = 7'b0000110;
      4'h2: segments = 7'b1011011;
      4'h3: segments = 7'b1001111;
      4'h4: segments = 7'b1100110;
      4'h5: segments = 7'b1101101;
      4'h6: segments = 7'b1111101;
      4'h7: segments = 7'b0000111;
      4'h8: segments = 7'b1111111;
      4'h9: segments = 7'b1101111;
      4'ha: segments = 7'b1110111;
      4'hb: segments = 7'b1111100;
      4'hc: segments = 7'b0111001;
      4'hd: segments = 7'b1011110;
      4'he: segments = 7'b1111001;
      default: segments = 7'b1110001;
    endcase
endmodule
