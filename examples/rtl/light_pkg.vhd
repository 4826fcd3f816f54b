-- The phases of a pedestrian crossing and the lamp pattern of each.
library ieee;
use ieee.std_logic_1164.all;

package light_pkg is
  type phase_t is (cars_go, cars_stop, walk, walk_end);
  subtype lamps_t is std_logic_vector(2 downto 0);  -- red, amber, green
  function lamps_for(phase : phase_t) return lamps_t;
end package light_pkg;

package body light_pkg is
  function lamps_for(phase : phase_t) return lamps_t is
  begin
    case phase is
      when cars_go   => return "001";
      when cars_stop => return "010";
      when others    => return "100";
    end case;
  end function;
end package body light_pkg;
