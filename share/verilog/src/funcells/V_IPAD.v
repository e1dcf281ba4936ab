// V_IPAD: input pad; PAD stands for the package pin.
module V_IPAD (
    output PAD
);
endmodule
