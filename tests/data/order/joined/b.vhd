entity b is
  port (clk : in bit);
end entity b;

architecture rtl of b is
  component a
    port (clk : in bit);
  end component;
begin
  u_a : a port map (clk => clk);
end architecture rtl;
