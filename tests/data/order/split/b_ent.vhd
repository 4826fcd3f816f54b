entity b is
  port (clk : in bit);
end entity b;
