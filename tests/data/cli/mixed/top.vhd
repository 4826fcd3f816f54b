library ieee;
use ieee.std_logic_1164.all;

entity top is
  port (clk : in std_logic; q : out std_logic_vector(1 downto 0));
end entity top;

architecture rtl of top is
begin
  u_core : entity work.core(rtl)
    port map (clk => clk, q => q);
end architecture rtl;
