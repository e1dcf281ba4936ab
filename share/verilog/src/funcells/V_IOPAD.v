// V_IOPAD: bidirectional pad; PAD stands for the package pin.
module V_IOPAD (
    inout PAD
);
endmodule
