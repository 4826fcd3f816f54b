-- The top level: the middle level, a unit that exists nowhere and a cell of the cell library.
library ieee;
use ieee.std_logic_1164.all;

entity top is
  port (d : in std_logic; q : out std_logic);
end entity top;

architecture rtl of top is
  component mid
    port (d : in std_logic; q : out std_logic);
  end component;
  component ghost
    port (a : in std_logic);
  end component;
  component QL_INV
    port (A : in std_logic; Y : out std_logic);
  end component;
  signal inverted : std_logic;
begin
  u_mid : mid port map (d => d, q => q);
  u_ghost : ghost port map (a => d);
  u_cell : QL_INV port map (A => d, Y => inverted);
end architecture rtl;
