module latch #(parameter N = 8) (input en, input [N-1:0] d, output reg [N-1:0] q);
endmodule

module relay (input en, input [3:0] d, output [3:0] q);
  latch #(.N(4)) u_latch (.en(en), .d(d), .q(q));
endmodule
