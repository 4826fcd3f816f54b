architecture rtl of b is
begin
  u_a : entity work.a port map (clk => clk);
end architecture rtl;
