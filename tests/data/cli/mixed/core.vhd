library ieee;
use ieee.std_logic_1164.all;
library shared;
use shared.shared_pkg.all;

entity core is
  port (clk : in std_logic; q : out std_logic_vector(LANES - 1 downto 0));
end entity core;

architecture rtl of core is
  component lane is
    port (clk : in std_logic; q : out std_logic);
  end component;
begin
  lanes : for i in 0 to LANES - 1 generate
    u_lane : lane port map (clk => clk, q => q(i));
  end generate lanes;
end architecture rtl;
