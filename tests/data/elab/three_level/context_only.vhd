-- A context clause and nothing it applies to.
library ieee;
use ieee.std_logic_1164.all;
