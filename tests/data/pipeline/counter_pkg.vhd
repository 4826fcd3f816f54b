library ieee;
use ieee.std_logic_1164.all;

package counter_pkg is
  constant WIDTH : integer := 8;
end package counter_pkg;

package body counter_pkg is
end package body counter_pkg;
