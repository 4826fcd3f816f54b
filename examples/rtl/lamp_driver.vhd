-- Drives one set of lamps from a phase.
library ieee;
use ieee.std_logic_1164.all;
use work.light_pkg.all;

entity lamp_driver is
  generic (FOR_PEOPLE : boolean := false);
  port (
    phase : in  phase_t;
    lamps : out lamps_t
  );
end entity lamp_driver;

architecture rtl of lamp_driver is
begin
  lamps <= lamps_for(phase) when not FOR_PEOPLE else
           "001" when phase = walk else "100";
end architecture rtl;
