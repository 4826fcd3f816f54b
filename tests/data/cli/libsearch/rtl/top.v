module top(input clk, input a, output y);
  wire w;
  alu u_alu(.clk(clk), .a(a), .y(w));
  regfile u_regs(.clk(clk), .d(w), .q(y));
  counter u_count(.clk(clk));
endmodule
