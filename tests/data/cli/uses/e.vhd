library ieee;
use ieee.std_logic_1164.all;
entity e is end;
architecture a of e is
  use work.p.all;
begin
end;
