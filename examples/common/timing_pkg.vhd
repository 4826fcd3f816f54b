-- Shared timing helpers, compiled into the library "common".
library ieee;
use ieee.std_logic_1164.all;
use ieee.numeric_std.all;

package timing_pkg is
  constant CLOCK_HZ : natural := 1_000_000;
  function ticks_for_ms(ms : natural) return natural;
end package timing_pkg;

package body timing_pkg is
  function ticks_for_ms(ms : natural) return natural is
  begin
    return ms * (CLOCK_HZ / 1000);
  end function;
end package body timing_pkg;
