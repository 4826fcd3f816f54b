entity gamma_unit is
  port (clk : in bit);
end entity gamma_unit;
