-- A small system: a counter package, the counter, and a top level that instantiates the
-- counter by component, by entity with and without an architecture, and a bound blinker
-- inside a generate statement.
library ieee;
use ieee.std_logic_1164.all;
use ieee.numeric_std.all;

package counter_pkg is
  constant WIDTH : natural := 8;
  function next_value(v : unsigned) return unsigned;
end package counter_pkg;

package body counter_pkg is
  function next_value(v : unsigned) return unsigned is
  begin
    return v + 1;
  end function;
end package body counter_pkg;

library ieee;
use ieee.std_logic_1164.all;
use work.counter_pkg.all;

entity counter is
  generic (STEP : natural := 1);
  port (
    clk   : in  std_logic;
    count : out std_logic_vector(WIDTH - 1 downto 0)
  );
end entity counter;

architecture rtl of counter is
  signal value : unsigned(WIDTH - 1 downto 0) := (others => '0');
begin
  process (clk)
  begin
    if rising_edge(clk) then
      value <= next_value(value);  -- wraps at the top
    end if;
  end process;
  count <= std_logic_vector(value);
end architecture rtl;

library ieee, work;
use ieee.std_logic_1164.all;

entity soc_top is
  port (
    clk  : in  std_logic;
    leds : out std_logic_vector(31 downto 0)
  );
end entity soc_top;

architecture structural of soc_top is
  component counter is
    generic (STEP : natural := 1);
    port (clk : in std_logic; count : out std_logic_vector(7 downto 0));
  end component;
  component blinker is
    port (clk : in std_logic; led : out std_logic);
  end component;
  for all : blinker use entity work.slow_blinker;
  signal low_count : std_logic_vector(7 downto 0);
begin
  leds(7 downto 0) <= low_count;

  u_count : counter
    generic map (STEP => 1)
    port map (clk => clk, count => low_count);

  u_fast : entity work.counter(rtl)
    port map (clk => clk, count => leds(15 downto 8));

  u_plain : entity work.counter
    port map (clk => clk, count => leds(23 downto 16));

  lanes : for i in 0 to 3 generate
    u_blink : blinker port map (clk => clk, led => leds(24 + i));
  end generate lanes;

  u_last : component counter port map (clk => clk, count => open);
end architecture structural;
