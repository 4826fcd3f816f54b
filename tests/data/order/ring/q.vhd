entity q is
  port (clk : in bit);
end entity q;

architecture rtl of q is
begin
  u_r : entity work.r port map (clk => clk);
end architecture rtl;
