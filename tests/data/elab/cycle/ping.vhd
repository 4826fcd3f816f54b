library ieee;
use ieee.std_logic_1164.all;

entity ping is
  port (x : in std_logic);
end entity ping;

architecture rtl of ping is
  component pong
    port (x : in std_logic);
  end component;
begin
  u_pong : pong port map (x => x);
end architecture rtl;
