`ifdef HAVE_SECOND
module second(input a);
endmodule
`endif
