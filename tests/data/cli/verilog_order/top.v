`define HAVE_TOP 1
module top;
  mid u_mid();
endmodule
module leaf;
endmodule
