`ifdef HAVE_TOP
module mid;
  leaf u_leaf();
  vh u_vh();
endmodule
`endif
