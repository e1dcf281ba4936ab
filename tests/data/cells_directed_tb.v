// Directed checks of the timing models' documented behaviour: the global
// set/reset and tristate, lookup table bit order and unknown inputs, clock
// multiplexer polarity, differential input, dual-rate flop, block RAM
// contents (also through the big-ending variant's reversed buses) and the
// clock manager's lock and output frequencies. Prints one FAIL line per
// failed check and a summary line.
`timescale 1 ns/1 ps
module cells_directed_tb;
  integer checks = 0;
  integer failures = 0;

  task check;
    input [8*48-1:0] what;
    input [31:0] got;
    input [31:0] want;
    begin
      checks = checks + 1;
      if (got !== want) begin
        failures = failures + 1;
        $display("FAIL: %0s: got %b, want %b at %0t", what, got, want, $time);
      end
    end
  endtask

  task check_time;
    input [8*48-1:0] what;
    input real got;
    input real want;
    begin
      checks = checks + 1;
      if (got < want - 0.01 || got > want + 0.01) begin
        failures = failures + 1;
        $display("FAIL: %0s: %f ns, want %f ns", what, got, want);
      end
    end
  endtask

  reg clk = 1'b0;
  always #10 clk = ~clk;

  // Global set/reset: flops hold INIT for the first 100 ns.
  reg d0 = 1'b0, clr = 1'b1;
  wire q_fd, q_fdce, q_fdpe;
  V_FD #(.INIT(1'b1)) fd (.C(clk), .D(d0), .Q(q_fd));
  V_FDCE #(.INIT(1'b1)) fdce (.C(clk), .CE(1'b1), .CLR(clr), .D(1'b1), .Q(q_fdce));
  V_FDPE #(.INIT(1'b0)) fdpe (.C(clk), .CE(1'b1), .PRE(1'b0), .D(1'b1), .Q(q_fdpe));

  // Global tristate.
  reg obuf_i = 1'b1;
  wire obuf_o, obuft_o, iobuf_o, iobuf_io;
  V_OBUF obuf (.I(obuf_i), .O(obuf_o));
  V_OBUFT obuft (.I(obuf_i), .T(1'b0), .O(obuft_o));
  V_IOBUF iobuf (.I(obuf_i), .T(1'b0), .O(iobuf_o), .IO(iobuf_io));

  // Lookup tables.
  reg [5:0] li = 6'd0;
  reg lx = 1'b0;
  wire lut6_o, lut2_o, lut1_o;
  V_LUT6 #(.INIT(64'h8000000000000004)) lut6 (
      .I0(li[0]), .I1(li[1]), .I2(li[2]), .I3(li[3]), .I4(li[4]), .I5(li[5]), .O(lut6_o));
  V_LUT2 #(.INIT(4'b1100)) lut2 (.I0(lx), .I1(li[0]), .O(lut2_o));
  V_LUT1 #(.INIT(2'b01)) lut1 (.I0(li[0]), .O(lut1_o));

  // Clock multiplexers and the differential input buffer.
  reg sel = 1'b0, di = 1'b0, dib = 1'b1;
  wire mux_o, mux1_o, ds_o;
  V_BUFGMUX mux (.I0(1'b0), .I1(1'b1), .S(sel), .O(mux_o));
  V_BUFGMUX_1 mux1 (.I0(1'b0), .I1(1'b1), .S(sel), .O(mux1_o));
  V_IBUFDS ds (.I(di), .IB(dib), .O(ds_o));

  // Dual-rate flop.
  wire ddr_q;
  V_FDDRCPE ddr (.C0(clk), .C1(~clk), .CE(1'b1), .CLR(1'b0), .PRE(1'b0), .D0(1'b1), .D1(1'b0),
                 .Q(ddr_q));

  // Block RAMs with the same contents; the big-ending one is connected as
  // the netlist writer connects it, bit i of a bus to index i.
  localparam [255:0] C00 = 256'h1f1e1d1c1b1a191817161514131211100f0e0d0c0b0a09080706050403020100;
  localparam [255:0] C01 = 256'h3f3e3d3c3b3a393837363534333231302f2e2d2c2b2a29282726252423222120;
  localparam [255:0] C0F = 256'hc3000000000000000000000000000000000000000000000000000000000000a5;
  reg en = 1'b1, we = 1'b0, rst = 1'b0;
  reg [8:0] addr = 9'd0;
  reg [7:0] din = 8'h00;
  wire [7:0] dout, dout_be;
  V_RAMB4_S8 #(.INIT_00(C00), .INIT_01(C01), .INIT_0F(C0F)) ram (
      .CLK(clk), .EN(en), .WE(we), .RST(rst), .ADDR(addr), .DI(din), .DO(dout));
  V_RAMB4_S8_BE #(.INIT_00(C00), .INIT_01(C01), .INIT_0F(C0F)) ram_be (
      .CLK(clk), .EN(en), .WE(we), .RST(rst),
      .ADDR({addr[0], addr[1], addr[2], addr[3], addr[4], addr[5], addr[6], addr[7], addr[8]}),
      .DI({din[0], din[1], din[2], din[3], din[4], din[5], din[6], din[7]}),
      .DO({dout_be[0], dout_be[1], dout_be[2], dout_be[3], dout_be[4], dout_be[5], dout_be[6],
           dout_be[7]}));

  // Clock manager on a 20 ns input clock.
  reg dcm_rst = 1'b1;
  wire clk0, clk90, clk180, clk270, clk2x, clk2x180, clkdv, clkfx, locked;
  V_DCM #(.CLKDV_DIVIDE(2.5), .CLKFX_MULTIPLY(3), .CLKFX_DIVIDE(2)) dcm (
      .CLKIN(clk), .CLKFB(clk0), .RST(dcm_rst), .CLK0(clk0), .CLK90(clk90), .CLK180(clk180),
      .CLK270(clk270), .CLK2X(clk2x), .CLK2X180(clk2x180), .CLKDV(clkdv), .CLKFX(clkfx),
      .LOCKED(locked));

  real t0, t90, t2x_a, t2x_b, tdv_a, tdv_b, tfx_a, tfx_b, tlock;
  integer n;
  initial tlock = 0.0;
  always @(posedge locked) tlock = $realtime;

  initial begin
    // During the global set/reset.
    #50;
    check("V_FD holds INIT during GSR", q_fd, 1);
    check("V_FDCE: GSR before CLR", q_fdce, 1);
    check("V_FDPE holds INIT during GSR", q_fdpe, 0);
    check("V_RAMB4_S8 DO is 0 during GSR", dout, 0);
    #51;  // 101 ns: GSR has ended while CLR is still 1
    check("V_FDCE clears when GSR ends under CLR", q_fdce, 0);
    clr = 1'b0;
    #10;  // past the clock edge at 110 ns
    check("V_FD follows D after GSR", q_fd, 0);
    check("V_FDPE follows D after GSR", q_fdpe, 1);
    check("V_FDCE follows D after CLR", q_fdce, 1);

    check("V_OBUF drives", obuf_o, 1);
    force chipwide.GTS = 1'b1;
    #1;
    check("V_OBUF floats under GTS", obuf_o, 1'bz);
    check("V_OBUFT floats under GTS", obuft_o, 1'bz);
    check("V_IOBUF pad floats under GTS", iobuf_io, 1'bz);
    release chipwide.GTS;
    #1;
    check("V_OBUFT drives after GTS", obuft_o, 1);
    check("V_IOBUF reads its pad", iobuf_o, 1);

    li = 6'b000000;
    #1 check("V_LUT6 INIT[0]", lut6_o, 0);
    li = 6'b000010;
    #1 check("V_LUT6 INIT[2]: I1 has weight 2", lut6_o, 1);
    li = 6'b111111;
    #1 check("V_LUT6 INIT[63]", lut6_o, 1);
    li = 6'b000001;
    lx = 1'bx;
    #1 check("V_LUT2 ignores an unknown input it does not need", lut2_o, 1);
    check("V_LUT1 INIT 01 inverts", lut1_o, 0);

    sel = 1'b0;
    #1 check("V_BUFGMUX S=0 selects I0", mux_o, 0);
    check("V_BUFGMUX_1 S=0 selects I1", mux1_o, 1);
    sel = 1'b1;
    #1 check("V_BUFGMUX S=1 selects I1", mux_o, 1);
    check("V_BUFGMUX_1 S=1 selects I0", mux1_o, 0);
    sel = 1'bx;
    #1 check("V_BUFGMUX unknown S", mux_o, 1'bx);
    di = 1'b1;
    dib = 1'b0;
    #1 check("V_IBUFDS 1", ds_o, 1);
    di = 1'b0;
    dib = 1'b1;
    #1 check("V_IBUFDS 0", ds_o, 0);
    dib = 1'b0;
    #1 check("V_IBUFDS equal inputs", ds_o, 1'bx);

    @(posedge clk) #1 check("V_FDDRCPE takes D0 on C0", ddr_q, 1);
    @(negedge clk) #1 check("V_FDDRCPE takes D1 on C1", ddr_q, 0);

    // Block RAM: contents, write first, reset of the output.
    @(negedge clk) addr = 9'd33;
    @(posedge clk) #1 check("V_RAMB4_S8 byte 33 is INIT_01[15:8]", dout, 8'h21);
    check("V_RAMB4_S8_BE byte 33", dout_be, 8'h21);
    @(negedge clk) addr = 9'd511;
    @(posedge clk) #1 check("V_RAMB4_S8 byte 511 is INIT_0F[255:248]", dout, 8'hc3);
    check("V_RAMB4_S8_BE byte 511", dout_be, 8'hc3);
    @(negedge clk) addr = 9'd480;
    @(posedge clk) #1 check("V_RAMB4_S8 byte 480 is INIT_0F[7:0]", dout, 8'ha5);
    check("V_RAMB4_S8_BE byte 480", dout_be, 8'ha5);
    @(negedge clk) begin
      addr = 9'd5;
      we = 1'b1;
      din = 8'h96;
    end
    @(posedge clk) #1 check("V_RAMB4_S8 writes first", dout, 8'h96);
    check("V_RAMB4_S8_BE writes first", dout_be, 8'h96);
    @(negedge clk) begin
      we = 1'b0;
      addr = 9'd6;
    end
    @(posedge clk) #1 check("V_RAMB4_S8 byte 6 unchanged", dout, 8'h06);
    @(negedge clk) addr = 9'd5;
    @(posedge clk) #1 check("V_RAMB4_S8 reads back the write", dout, 8'h96);
    check("V_RAMB4_S8_BE reads back the write", dout_be, 8'h96);
    @(negedge clk) rst = 1'b1;
    @(posedge clk) #1 check("V_RAMB4_S8 RST clears DO", dout, 8'h00);
    @(negedge clk) begin
      rst = 1'b0;
      en = 1'b0;
    end
    @(posedge clk) #1 check("V_RAMB4_S8 keeps DO while EN is 0", dout, 8'h00);

    // Clock manager: out of reset on a falling input edge; locked on the
    // fourth rising edge after.
    @(negedge clk) dcm_rst = 1'b0;
    check("V_DCM not locked after RST", locked, 0);
    t0 = $realtime;
    wait (locked === 1'b1);
    check_time("V_DCM locks on the fourth rising edge", tlock - t0, 70.0);
    check("V_DCM CLK180 is the inverse of CLK0", clk180 ^ clk0, 1);
    @(posedge clk0) t0 = $realtime;
    @(posedge clk90) t90 = $realtime;
    check_time("V_DCM CLK90 a quarter period late", t90 - t0, 5.0);
    @(posedge clk2x) t2x_a = $realtime;
    @(posedge clk2x) t2x_b = $realtime;
    check_time("V_DCM CLK2X period", t2x_b - t2x_a, 10.0);
    @(posedge clkdv) tdv_a = $realtime;
    @(posedge clkdv) tdv_b = $realtime;
    check_time("V_DCM CLKDV period, divided by 2.5", tdv_b - tdv_a, 50.0);
    @(posedge clkfx) tfx_a = $realtime;
    for (n = 0; n < 3; n = n + 1) @(posedge clkfx) tfx_b = $realtime;
    check_time("V_DCM CLKFX three periods in two", tfx_b - tfx_a, 40.0);
    dcm_rst = 1'b1;
    #1 check("V_DCM RST drops LOCKED", locked, 0);
    check("V_DCM RST stops CLK0", clk0, 0);

    $display("directed: %0d checks, %0d failures", checks, failures);
    $finish;
  end
endmodule
