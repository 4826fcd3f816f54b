-- Two designs share this file: mid (used by top) and side, which nothing instantiates.
entity mid is
  port (clk : in bit);
end entity mid;

use work.util.all;
architecture rtl of mid is
begin
end architecture rtl;

entity side is
  port (clk : in bit);
end entity side;

architecture rtl of side is
begin
  u_leaf : entity work.leaf port map (clk => clk);
end architecture rtl;
