-- Counts down the length of the current phase.
library ieee;
use ieee.std_logic_1164.all;
library common;
use common.timing_pkg.all;

entity phase_timer is
  generic (PHASE_MS : natural := 500);
  port (
    clk     : in  std_logic;
    restart : in  std_logic;
    expired : out std_logic
  );
end entity phase_timer;

architecture rtl of phase_timer is
  signal remaining : natural range 0 to ticks_for_ms(PHASE_MS) := 0;
begin
  process (clk)
  begin
    if rising_edge(clk) then
      if restart = '1' then
        remaining <= ticks_for_ms(PHASE_MS);
      elsif remaining /= 0 then
        remaining <= remaining - 1;
      end if;
    end if;
  end process;
  expired <= '1' when remaining = 0 else '0';
end architecture rtl;
