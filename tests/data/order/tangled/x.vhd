-- Each file declares a package that the other file's architecture uses, and the architectures
-- instantiate each other's entities: no order of the two files can be valid.
package px is
  constant X_WIDTH : natural := 4;
end package px;

entity x is
  port (clk : in bit);
end entity x;

use work.py.all;
architecture rtl of x is
begin
  u_y : entity work.y port map (clk => clk);
end architecture rtl;
