-- Compiled into "work".
library ieee;
use ieee.std_logic_1164.all;

package types_pkg is
  subtype word is std_logic_vector(7 downto 0);
end package types_pkg;
