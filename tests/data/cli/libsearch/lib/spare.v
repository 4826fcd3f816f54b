module spare(input a);
endmodule
