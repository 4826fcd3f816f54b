`include "options.vh"
`ifdef FROM_INCLUDE
module from_include(input a);
endmodule
`endif
`ifdef FROM_COMMAND_LINE
module from_command_line(input a);
endmodule
`endif
