`define HAVE_SECOND
module first(input a);
endmodule
