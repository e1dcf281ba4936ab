`define INV ~
