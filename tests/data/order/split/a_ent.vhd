entity a is
  port (clk : in bit);
end entity a;
