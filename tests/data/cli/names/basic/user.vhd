library VLIB;
use VLIB.ScoreboardPkg_slv.all;
use work.my_pkg.all;
entity user is
end entity;
architecture rtl of OTHER is
begin
end architecture;
