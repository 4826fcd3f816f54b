// The crossing's audible signal: ticks while pedestrians may walk.
`define TICK_BITS 12

module chime (
    input  wire clk,
    input  wire walk,
    output reg  tone
);
  reg [`TICK_BITS-1:0] count;

  always @(posedge clk) begin
    if (!walk) begin
      count <= 0;
      tone  <= 1'b0;
    end else begin
      count <= count + 1'b1;
      tone  <= count[`TICK_BITS-1];
    end
  end
endmodule
