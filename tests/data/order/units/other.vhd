entity other is
  port (clk : in bit);
end entity other;

architecture rtl of other is
begin
end architecture rtl;
