library ieee;
use ieee.std_logic_1164.all;

entity meter is
  generic (SCALE : integer);
  port (reading : out std_logic_vector(SCALE - 1 downto 0));
end entity meter;
