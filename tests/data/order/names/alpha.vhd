entity alpha_unit is
  port (clk : in bit);
end entity alpha_unit;
