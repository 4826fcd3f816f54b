entity top is end entity;
architecture rtl of top is begin
  u : entity work.absent;
end architecture;
