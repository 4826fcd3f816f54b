-- Timing models of the lumen family. The timing primitives themselves are shared by every family
-- (they live in the default timecell library); this file marks the family as installed.

library ieee;
use ieee.std_logic_1164.all;

entity QT_BUF is
   generic (
      TPD_A_Y : time := 0.12 ns
   );
   port (
      A : in  std_logic;
      Y : out std_logic
   );
end entity QT_BUF;

architecture timing of QT_BUF is
begin
   Y <= A after TPD_A_Y;
end architecture timing;

library ieee;
use ieee.std_logic_1164.all;

entity QT_FF is
   generic (
      TSETUP_D_CLK : time      := 0.05 ns;
      THOLD_D_CLK  : time      := 0.02 ns;
      TPD_CLK_Q    : time      := 0.18 ns;
      INIT         : std_logic := '0'
   );
   port (
      D, CLK, SR, CE : in  std_logic;
      Q              : out std_logic := INIT
   );
end entity QT_FF;

architecture timing of QT_FF is
begin
   process (CLK, SR)
   begin
      if SR = '1' then
         Q <= INIT after TPD_CLK_Q;
      elsif rising_edge(CLK) and CE = '1' then
         assert D'stable(TSETUP_D_CLK) report "QT_FF: setup time violated" severity warning;
         Q <= D after TPD_CLK_Q;
      end if;
   end process;
end architecture timing;
