module sub(input a, input b, output y); assign y = a & b; endmodule
module chip(input clk, input [1:0] d, output q, (* LOC = "P9" *) output z);
  (* LOC = "P1" *) V_IPAD p_clk(.PAD(clk));
  (* PINNAME = "P2" *) V_IPAD p_d0(.PAD(d[0]));
  (* LOC = "P3" *) V_IPAD p_d1(.PAD(d[1]));
  (* keep, LOC = "P4" *) V_OPAD p_q(.PAD(q));
  (* keep *) V_OPAD p_z(.PAD(z));
  reg r; always @(posedge clk) r <= d[0];
  assign q = r;
  sub u(.a(d[0]), .b(d[1]), .y(z));
endmodule
