entity top is
end entity;
architecture rtl of top is
begin
  u_default : entity work.leaf port map (a => open);
  u_alpha : entity work.leaf(alpha) port map (a => open);
end architecture;
