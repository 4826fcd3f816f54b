-- A pedestrian crossing: button, controller and the two sets of lamps.
library ieee;
use ieee.std_logic_1164.all;
use work.light_pkg.all;

entity crossing is
  port (
    clk          : in  std_logic;
    button       : in  std_logic;
    car_lamps    : out lamps_t;
    people_lamps : out lamps_t;
    beeper       : out std_logic
  );
end entity crossing;

architecture structural of crossing is
  component lamp_driver is
    generic (FOR_PEOPLE : boolean := false);
    port (phase : in phase_t; lamps : out lamps_t);
  end component;
  component chime is
    port (clk : in std_logic; walk : in std_logic; tone : out std_logic);
  end component;
  signal request : std_logic;
  signal walking : std_logic;
  signal phase   : phase_t;
begin
  input : entity work.debounce
    port map (clk => clk, button => button, pulse => request);

  control : entity work.controller(rtl)
    port map (clk => clk, request => request, phase => phase);

  cars : lamp_driver
    port map (phase => phase, lamps => car_lamps);

  people : lamp_driver
    generic map (FOR_PEOPLE => true)
    port map (phase => phase, lamps => people_lamps);

  walking <= '1' when phase = WALK else '0';

  bell : chime
    port map (clk => clk, walk => walking, tone => beeper);
end architecture structural;
