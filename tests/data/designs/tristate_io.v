// nlw-test: no-proof (tristate buffers and inout ports)
//
// Tristate output and inout buses on the top module's ports (output and
// bidirectional pad buffers), an internal bus with two tristate drivers
// (which the flow turns into logic), and a net driven by the tristate
// outputs of two sub-module instances (internal tristate buffers).
module tristate_io (
    input clk,
    input rst,
    input oe,
    input sel,
    input [3:0] d,
    output [3:0] t,
    inout [3:0] io,
    output [3:0] io_seen,
    output [3:0] shared,
    output [3:0] joined,
    output reg [3:0] q
);
  always @(posedge clk)
    if (rst) q <= 4'd0;
    else q <= q + d;

  assign t = oe ? q : 4'bz;
  assign io = sel ? d ^ q : 4'bz;
  assign io_seen = io;

  wire [3:0] bus;
  assign bus = sel ? d : 4'bz;
  assign bus = sel ? 4'bz : q;
  assign shared = bus;

  wire [3:0] link;
  tri_driver u_first (
      .a(d),
      .en(sel),
      .y(link)
  );
  tri_driver u_second (
      .a(~q),
      .en(~sel),
      .y(link)
  );
  assign joined = link;
endmodule

module tri_driver (
    input [3:0] a,
    input en,
    output [3:0] y
);
  assign y = en ? a : 4'bz;
endmodule
