// Maps the fine-grained flip-flops that dfflegalize leaves (rising clock,
// active-high enable and resets; the flow lets dfflegalize add inverters for
// the other polarities) onto the library's flip-flops. The initial value of
// the flop's output becomes INIT; an undefined one is taken as 1 for a
// preset flop and as 0 for the others.

(* techmap_celltype = "$_DFF_P_" *)
module map_dff_p (input C, input D, output Q);
  parameter _TECHMAP_WIREINIT_Q_ = 1'bx;
  V_FD #(.INIT(_TECHMAP_WIREINIT_Q_ === 1'b1)) _TECHMAP_REPLACE_ (.C(C), .D(D), .Q(Q));
  wire _TECHMAP_REMOVEINIT_Q_ = 1'b1;
endmodule

(* techmap_celltype = "$_DFFE_PP_" *)
module map_dffe_pp (input C, input E, input D, output Q);
  parameter _TECHMAP_WIREINIT_Q_ = 1'bx;
  V_FDCE #(.INIT(_TECHMAP_WIREINIT_Q_ === 1'b1)) _TECHMAP_REPLACE_ (
      .C(C), .CE(E), .CLR(1'b0), .D(D), .Q(Q));
  wire _TECHMAP_REMOVEINIT_Q_ = 1'b1;
endmodule

// Asynchronous clear and preset, without and with enable.
(* techmap_celltype = "$_DFF_PP0_" *)
module map_dff_pp0 (input C, input R, input D, output Q);
  parameter _TECHMAP_WIREINIT_Q_ = 1'bx;
  V_FDCE #(.INIT(_TECHMAP_WIREINIT_Q_ === 1'b1)) _TECHMAP_REPLACE_ (
      .C(C), .CE(1'b1), .CLR(R), .D(D), .Q(Q));
  wire _TECHMAP_REMOVEINIT_Q_ = 1'b1;
endmodule

(* techmap_celltype = "$_DFF_PP1_" *)
module map_dff_pp1 (input C, input R, input D, output Q);
  parameter _TECHMAP_WIREINIT_Q_ = 1'bx;
  V_FDPE #(.INIT(_TECHMAP_WIREINIT_Q_ !== 1'b0)) _TECHMAP_REPLACE_ (
      .C(C), .CE(1'b1), .PRE(R), .D(D), .Q(Q));
  wire _TECHMAP_REMOVEINIT_Q_ = 1'b1;
endmodule

(* techmap_celltype = "$_DFFE_PP0P_" *)
module map_dffe_pp0p (input C, input R, input E, input D, output Q);
  parameter _TECHMAP_WIREINIT_Q_ = 1'bx;
  V_FDCE #(.INIT(_TECHMAP_WIREINIT_Q_ === 1'b1)) _TECHMAP_REPLACE_ (
      .C(C), .CE(E), .CLR(R), .D(D), .Q(Q));
  wire _TECHMAP_REMOVEINIT_Q_ = 1'b1;
endmodule

(* techmap_celltype = "$_DFFE_PP1P_" *)
module map_dffe_pp1p (input C, input R, input E, input D, output Q);
  parameter _TECHMAP_WIREINIT_Q_ = 1'bx;
  V_FDPE #(.INIT(_TECHMAP_WIREINIT_Q_ !== 1'b0)) _TECHMAP_REPLACE_ (
      .C(C), .CE(E), .PRE(R), .D(D), .Q(Q));
  wire _TECHMAP_REMOVEINIT_Q_ = 1'b1;
endmodule

// Synchronous reset and set, acting whatever the enable is.
(* techmap_celltype = "$_SDFF_PP0_" *)
module map_sdff_pp0 (input C, input R, input D, output Q);
  parameter _TECHMAP_WIREINIT_Q_ = 1'bx;
  V_FDRSE #(.INIT(_TECHMAP_WIREINIT_Q_ === 1'b1)) _TECHMAP_REPLACE_ (
      .C(C), .CE(1'b1), .R(R), .S(1'b0), .D(D), .Q(Q));
  wire _TECHMAP_REMOVEINIT_Q_ = 1'b1;
endmodule

(* techmap_celltype = "$_SDFF_PP1_" *)
module map_sdff_pp1 (input C, input R, input D, output Q);
  parameter _TECHMAP_WIREINIT_Q_ = 1'bx;
  V_FDRSE #(.INIT(_TECHMAP_WIREINIT_Q_ === 1'b1)) _TECHMAP_REPLACE_ (
      .C(C), .CE(1'b1), .R(1'b0), .S(R), .D(D), .Q(Q));
  wire _TECHMAP_REMOVEINIT_Q_ = 1'b1;
endmodule

(* techmap_celltype = "$_SDFFE_PP0P_" *)
module map_sdffe_pp0p (input C, input R, input E, input D, output Q);
  parameter _TECHMAP_WIREINIT_Q_ = 1'bx;
  V_FDRSE #(.INIT(_TECHMAP_WIREINIT_Q_ === 1'b1)) _TECHMAP_REPLACE_ (
      .C(C), .CE(E), .R(R), .S(1'b0), .D(D), .Q(Q));
  wire _TECHMAP_REMOVEINIT_Q_ = 1'b1;
endmodule

(* techmap_celltype = "$_SDFFE_PP1P_" *)
module map_sdffe_pp1p (input C, input R, input E, input D, output Q);
  parameter _TECHMAP_WIREINIT_Q_ = 1'bx;
  V_FDRSE #(.INIT(_TECHMAP_WIREINIT_Q_ === 1'b1)) _TECHMAP_REPLACE_ (
      .C(C), .CE(E), .R(1'b0), .S(R), .D(D), .Q(Q));
  wire _TECHMAP_REMOVEINIT_Q_ = 1'b1;
endmodule
