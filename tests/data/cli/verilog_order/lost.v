module top;
  lost u_lost();
endmodule
