
(* blackbox *) module macro_cell(input [1:0] d, input e, output q); endmodule
module t(input [1:0] d, input e, output q);
  macro_cell #(.MODE("FAST"), .W(3)) m(.d(d), .e(e), .q(q));
endmodule