library ieee;
use ieee.std_logic_1164.all;

entity pong is
  port (x : in std_logic);
end entity pong;

architecture rtl of pong is
  component ping
    port (x : in std_logic);
  end component;
begin
  u_ping : ping port map (x => x);
end architecture rtl;
