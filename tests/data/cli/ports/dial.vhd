library ieee;
use ieee.std_logic_1164.all;
use ieee.numeric_std.all;

entity dial is
  generic (BITS : integer := 4);
  port (
    tick  : in    std_logic;
    value : out   unsigned(BITS - 1 downto 0);
    pads  : inout std_logic_vector(0 to 1)
  );
end entity dial;

architecture rtl of dial is
begin
end architecture rtl;
