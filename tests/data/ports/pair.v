module stage #(parameter W = 4) (
  input clk,
  input [W-1:0] d,
  output reg [0:W-1] q
);
endmodule

module duo (input clk, inout [1:0] pins);
  stage #(.W(2)) u0 (.clk(clk), .d(pins), .q());
endmodule
