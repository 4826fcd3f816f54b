-- Behavioural models of the macros that the lumen family adds to the macro library.

library ieee;
use ieee.std_logic_1164.all;
use ieee.numeric_std.all;

entity LM_RAM9K is
   generic (
      DATA_WIDTH : integer := 9;
      ADDR_WIDTH : integer := 10;
      WRITE_MODE : string  := "READ_FIRST"
   );
   port (
      CLK, EN, WE : in  std_logic;
      ADDR        : in  std_logic_vector(ADDR_WIDTH - 1 downto 0);
      DI          : in  std_logic_vector(DATA_WIDTH - 1 downto 0);
      DO          : out std_logic_vector(DATA_WIDTH - 1 downto 0)
   );
end entity LM_RAM9K;

architecture behaviour of LM_RAM9K is
   type memory_t is array (0 to 2 ** ADDR_WIDTH - 1) of std_logic_vector(DATA_WIDTH - 1 downto 0);
   signal memory : memory_t := (others => (others => '0'));
begin
   process (CLK)
   begin
      if rising_edge(CLK) and EN = '1' then
         if WE = '1' and WRITE_MODE = "WRITE_FIRST" then
            DO <= DI;
         else
            DO <= memory(to_integer(unsigned(ADDR)));
         end if;
         if WE = '1' then
            memory(to_integer(unsigned(ADDR))) <= DI;
         end if;
      end if;
   end process;
end architecture behaviour;

library ieee;
use ieee.std_logic_1164.all;
use ieee.numeric_std.all;

entity LM_DSP18 is
   generic (
      AREG   : integer := 1;
      BREG   : integer := 1;
      PREG   : integer := 1;
      OPMODE : bit_vector(3 downto 0) := "0000"
   );
   port (
      CLK, CE, RST : in  std_logic;
      A, B         : in  std_logic_vector(17 downto 0);
      C            : in  std_logic_vector(47 downto 0);
      P            : out std_logic_vector(47 downto 0)
   );
end entity LM_DSP18;

-- Registers on every stage; OPMODE "0001" adds C to the product.
architecture behaviour of LM_DSP18 is
begin
   process (CLK)
      variable product : signed(35 downto 0);
   begin
      if rising_edge(CLK) then
         if RST = '1' then
            P <= (others => '0');
         elsif CE = '1' then
            product := signed(A) * signed(B);
            if OPMODE = "0001" then
               P <= std_logic_vector(resize(product, 48) + signed(C));
            else
               P <= std_logic_vector(resize(product, 48));
            end if;
         end if;
      end if;
   end process;
end architecture behaviour;
