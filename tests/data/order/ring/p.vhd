entity p is
  port (clk : in bit);
end entity p;

architecture rtl of p is
begin
  u_q : entity work.q port map (clk => clk);
end architecture rtl;
