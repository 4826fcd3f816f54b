entity user is
  port (clk : in bit);
end entity user;

use work.shared.all;
architecture rtl of user is
begin
end architecture rtl;
