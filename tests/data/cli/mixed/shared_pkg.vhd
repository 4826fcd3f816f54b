library ieee;
use ieee.std_logic_1164.all;

package shared_pkg is
  constant LANES : natural := 2;
end package shared_pkg;
