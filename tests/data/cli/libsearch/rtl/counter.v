module counter(input clk);
endmodule
