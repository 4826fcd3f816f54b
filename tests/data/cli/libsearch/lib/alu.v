module alu(input clk, input a, output y);
  mux u_mux(.a(a), .y(y));
endmodule
