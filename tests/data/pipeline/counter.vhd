library ieee;
use ieee.std_logic_1164.all;
use work.counter_pkg.all;

entity counter is
  port (clk : in std_logic; q : out std_logic_vector(WIDTH - 1 downto 0));
end entity counter;

architecture rtl of counter is
  component adder
    port (a, b : in std_logic; s : out std_logic);
  end component;
begin
  u_add : adder port map (a => clk, b => clk, s => open);
  gen : for i in 0 to 1 generate
    u_bit : adder port map (a => clk, b => clk, s => open);
  end generate;
end architecture rtl;
