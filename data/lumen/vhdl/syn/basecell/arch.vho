-- Behavioural models of the cells that the lumen family adds to the unified cell library.

library ieee;
use ieee.std_logic_1164.all;

entity LM_LUT6 is
   generic (
      INIT : bit_vector(63 downto 0) := X"0000000000000000"
   );
   port (
      I0, I1, I2, I3, I4, I5 : in  std_logic;
      O                      : out std_logic
   );
end entity LM_LUT6;

architecture behaviour of LM_LUT6 is
begin
   process (I0, I1, I2, I3, I4, I5)
      variable index : natural;
   begin
      index := 0;
      if I0 = '1' then index := index + 1;  end if;
      if I1 = '1' then index := index + 2;  end if;
      if I2 = '1' then index := index + 4;  end if;
      if I3 = '1' then index := index + 8;  end if;
      if I4 = '1' then index := index + 16; end if;
      if I5 = '1' then index := index + 32; end if;
      O <= to_stdulogic(INIT(index));
   end process;
end architecture behaviour;

library ieee;
use ieee.std_logic_1164.all;

entity LM_MUXF7 is
   port (
      I0, I1, S : in  std_logic;
      O         : out std_logic
   );
end entity LM_MUXF7;

architecture behaviour of LM_MUXF7 is
begin
   O <= I1 when S = '1' else I0;
end architecture behaviour;

library ieee;
use ieee.std_logic_1164.all;

entity LM_DCC is
   port (
      CLKI, CE : in  std_logic;
      CLKO     : out std_logic
   );
end entity LM_DCC;

architecture behaviour of LM_DCC is
begin
   CLKO <= CLKI and CE;
end architecture behaviour;
