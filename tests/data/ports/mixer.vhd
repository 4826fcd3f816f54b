library ieee;
use ieee.std_logic_1164.all;
use work.sizes_pkg.all;

entity mixer is
  generic (WIDTH : integer := 8; DEPTH : integer := WIDTH / 4);
  port (
    clk     : in    std_logic;
    samples : in    std_logic_vector(WIDTH - 1 downto 0);
    level   : out   std_logic_vector(0 to DEPTH * 4 - 1);
    probe   : inout std_logic;
    lanes   : out   std_logic_vector(LANES - 1 downto 0)
  );
end entity mixer;

architecture rtl of mixer is
begin
  u_gauge : entity work.gauge port map (tick => clk, count => open);
end architecture rtl;
