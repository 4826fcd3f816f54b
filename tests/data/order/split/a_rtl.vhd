architecture rtl of a is
begin
  u_b : entity work.b port map (clk => clk);
end architecture rtl;
