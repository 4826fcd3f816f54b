-- Cleans up the push button of the crossing.
library ieee;
use ieee.std_logic_1164.all;

entity debounce is
  port (
    clk    : in  std_logic;
    button : in  std_logic;
    pulse  : out std_logic
  );
end entity debounce;

architecture rtl of debounce is
  signal history : std_logic_vector(3 downto 0) := (others => '0');
begin
  process (clk)
  begin
    if rising_edge(clk) then
      history <= history(2 downto 0) & button;
    end if;
  end process;
  pulse <= '1' when history = "0111" else '0';
end architecture rtl;
