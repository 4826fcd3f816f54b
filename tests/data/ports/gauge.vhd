library ieee;
use ieee.std_logic_1164.all;

entity gauge is
  generic (STEPS : integer);
  port (tick : in std_logic; count : out std_logic_vector(STEPS - 1 downto 0));
end entity gauge;

architecture rtl of gauge is
begin
end architecture rtl;
