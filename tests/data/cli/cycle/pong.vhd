entity pong is
  port (a : in bit; b : out bit);
end entity pong;

architecture rtl of pong is
begin
  echo : entity work.ping port map (a => a, b => b);
end architecture rtl;
