// V_IOBUF: bidirectional buffer: IO = I while T is 0 (floating while T is
// 1), O = IO.
module V_IOBUF (
    input  I,
    input  T,
    output O,
    inout  IO
);
  parameter IOSTANDARD = "DEFAULT";
  parameter DRIVE = 12;
  parameter SLEW = "SLOW";

  V_OBUFT #(
      .IOSTANDARD(IOSTANDARD),
      .DRIVE(DRIVE),
      .SLEW(SLEW)
  ) obuft (
      .I(I),
      .T(T),
      .O(IO)
  );
  V_IBUF #(
      .IOSTANDARD(IOSTANDARD)
  ) ibuf (
      .I(IO),
      .O(O)
  );
endmodule
