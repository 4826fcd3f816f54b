package py is
  constant Y_WIDTH : natural := 4;
end package py;

entity y is
  port (clk : in bit);
end entity y;

use work.px.all;
architecture rtl of y is
begin
  u_x : entity work.x port map (clk => clk);
end architecture rtl;
