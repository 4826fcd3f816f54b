entity Beta_unit is
  port (clk : in bit);
end entity Beta_unit;
