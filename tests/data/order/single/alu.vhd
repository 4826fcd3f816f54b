-- Everything in one file: a package, an entity and its architecture that uses both.
package alu_types is
  constant WIDTH : natural := 8;
end package alu_types;

use work.alu_types.all;
entity alu is
  port (clk : in bit);
end entity alu;

use work.alu_types.all;
architecture rtl of alu is
begin
end architecture rtl;
