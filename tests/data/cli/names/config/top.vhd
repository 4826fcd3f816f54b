entity top is
end entity;
architecture rtl of top is
  component MyComp is
  end component;
  for all : MYCOMP use entity WORK.SUB;
begin
  u_cfg : mycomp port map (a => open);
  u_direct : entity Work.sub(RTL) port map (a => open);
end architecture;
