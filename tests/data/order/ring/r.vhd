entity r is
  port (clk : in bit);
end entity r;

architecture rtl of r is
begin
  u_p : entity work.p port map (clk => clk);
end architecture rtl;
