-- The bottom level: uses the package of the other library.
library ieee;
use ieee.std_logic_1164.all;
library util;
use util.util_pkg.all;

entity leaf is
  port (d : in std_logic; q : out std_logic);
end entity leaf;

architecture rtl of leaf is
begin
  q <= d;
end architecture rtl;
