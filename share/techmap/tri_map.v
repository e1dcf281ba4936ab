// Maps the tristate drivers left inside the design (those on top-level
// ports become V_OBUFT or V_IOBUF) onto V_TRI. $_TBUF_ drives while E is 1;
// V_TRI floats while T is 1, so the enable is inverted.

(* techmap_celltype = "$_TBUF_" *)
module map_tbuf (input A, input E, output Y);
  wire off;
  V_INV inv (.I(E), .O(off));
  V_TRI _TECHMAP_REPLACE_ (.I(A), .T(off), .O(Y));
endmodule
