entity a is
end entity;
architecture rtl of a is
begin
  u : entity work.b port map (x => open);
end architecture;
