-- The middle level: one leaf by component, one by entity with its architecture.
library ieee;
use ieee.std_logic_1164.all;
use work.types_pkg.all;

entity mid is
  port (d : in std_logic; q : out std_logic);
end entity mid;

architecture rtl of mid is
  component leaf
    port (d : in std_logic; q : out std_logic);
  end component;
  signal link : std_logic;
begin
  u_leaf : leaf port map (d => d, q => link);
  u_leaf2 : entity work.leaf(rtl) port map (d => link, q => q);
end architecture rtl;
