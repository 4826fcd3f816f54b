-- Steps through the phases: a request stops the cars, lets people walk, then lets the cars go.
library ieee;
use ieee.std_logic_1164.all;
use work.light_pkg.all;

entity controller is
  port (
    clk     : in  std_logic;
    request : in  std_logic;
    phase   : out phase_t
  );
end entity controller;

architecture rtl of controller is
  signal current : phase_t := cars_go;
  signal restart, expired : std_logic;
begin
  timer : entity work.phase_timer(rtl)
    generic map (PHASE_MS => 2000)
    port map (clk => clk, restart => restart, expired => expired);

  process (clk)
  begin
    if rising_edge(clk) then
      restart <= '0';
      case current is
        when cars_go   => if request = '1' then current <= cars_stop; restart <= '1'; end if;
        when cars_stop => if expired = '1' then current <= walk; restart <= '1'; end if;
        when walk      => if expired = '1' then current <= walk_end; restart <= '1'; end if;
        when walk_end  => if expired = '1' then current <= cars_go; end if;
      end case;
    end if;
  end process;
  phase <= current;
end architecture rtl;
