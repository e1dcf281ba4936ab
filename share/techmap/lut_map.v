// Maps yosys's lookup tables ($lut, as abc leaves them) onto V_LUT1 to
// V_LUT6. Bit i of the LUT parameter is the output for the input value i,
// A[0] being the least significant input: that is V_LUTn's INIT with A[k]
// on input Ik. One-input tables that only pass or invert their input become
// V_BUF and V_INV.

(* techmap_celltype = "$lut" *)
module map_lut (A, Y);
  parameter WIDTH = 0;
  parameter LUT = 0;
  input [WIDTH-1:0] A;
  output Y;

  generate
    if (WIDTH == 1) begin
      if (LUT == 2'b10) begin
        V_BUF _TECHMAP_REPLACE_ (.I(A[0]), .O(Y));
      end else if (LUT == 2'b01) begin
        V_INV _TECHMAP_REPLACE_ (.I(A[0]), .O(Y));
      end else begin
        V_LUT1 #(.INIT(LUT)) _TECHMAP_REPLACE_ (.I0(A[0]), .O(Y));
      end
    end else if (WIDTH == 2) begin
      V_LUT2 #(.INIT(LUT)) _TECHMAP_REPLACE_ (.I0(A[0]), .I1(A[1]), .O(Y));
    end else if (WIDTH == 3) begin
      V_LUT3 #(.INIT(LUT)) _TECHMAP_REPLACE_ (.I0(A[0]), .I1(A[1]), .I2(A[2]), .O(Y));
    end else if (WIDTH == 4) begin
      V_LUT4 #(.INIT(LUT)) _TECHMAP_REPLACE_ (
          .I0(A[0]), .I1(A[1]), .I2(A[2]), .I3(A[3]), .O(Y));
    end else if (WIDTH == 5) begin
      V_LUT5 #(.INIT(LUT)) _TECHMAP_REPLACE_ (
          .I0(A[0]), .I1(A[1]), .I2(A[2]), .I3(A[3]), .I4(A[4]), .O(Y));
    end else if (WIDTH == 6) begin
      V_LUT6 #(.INIT(LUT)) _TECHMAP_REPLACE_ (
          .I0(A[0]), .I1(A[1]), .I2(A[2]), .I3(A[3]), .I4(A[4]), .I5(A[5]), .O(Y));
    end else begin
      wire _TECHMAP_FAIL_ = 1'b1;
    end
  endgenerate
endmodule
