// V_OPAD: output pad. PAD stands for the package pin the design drives.
`timescale 1 ns/1 ps
module V_OPAD (PAD);
  input PAD;
endmodule
