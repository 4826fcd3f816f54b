library util;
use util.pkg.all;
entity leaf is
end entity;
architecture rtl of leaf is
begin
end architecture;
entity top is
end entity;
architecture rtl of top is
begin
  a : entity work.leaf;
  b : entity work.leaf;
end architecture;
