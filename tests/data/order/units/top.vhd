entity top is
  port (clk : in bit);
end entity top;

architecture rtl of top is
begin
  u_mid : entity work.mid port map (clk => clk);
end architecture rtl;
