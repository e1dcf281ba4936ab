// Public names that are no simple identifiers; yosys writes them with its
// leading backslash. A backtick inside an escaped name.
module top(input \1st , input \a-b , input c, output \y.out , output [1:0] \2nd );
  (* keep *) wire \back`tick = c ^ \1st ;
  assign \y.out = \1st ^ \a-b ;
  assign \2nd = {\back`tick , \1st & \a-b };
endmodule
