// V_OPAD: output pad; PAD stands for the package pin.
module V_OPAD (
    input PAD
);
endmodule
