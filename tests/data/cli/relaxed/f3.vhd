architecture rtl of b is
begin
  u : entity work.a port map (x => open);
end architecture;
