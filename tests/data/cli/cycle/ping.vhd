entity ping is
  port (a : in bit; b : out bit);
end entity ping;

architecture rtl of ping is
begin
  echo : entity work.pong port map (a => a, b => b);
end architecture rtl;
