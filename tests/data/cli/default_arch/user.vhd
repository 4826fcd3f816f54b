architecture early of leaf is
begin
end architecture;
entity user is
end entity;
architecture rtl of user is
begin
  u_default : entity work.leaf port map (a => open);
end architecture;
