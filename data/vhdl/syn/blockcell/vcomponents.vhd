-- Component declarations of a Quillon sample cell library. The cells and their names are our own;
-- they exist so that instances of library cells are recognised without any installation.
--
-- blockcell: the macro library (block memories, multipliers, counters, registers,
-- multiplexers and coders).

library ieee;
use ieee.std_logic_1164.all;

package vcomponents is

   -- Block memories

   component QB_RAM4K
      generic (
         DATA_WIDTH : integer := 8;
         ADDR_WIDTH : integer := 9;
         WRITE_MODE : string := "READ_FIRST"
      );
      port (
         CLK  : in    std_logic;
         EN   : in    std_logic;
         WE   : in    std_logic;
         ADDR : in    std_logic_vector(ADDR_WIDTH - 1 downto 0);
         DI   : in    std_logic_vector(DATA_WIDTH - 1 downto 0);
         DO   : out   std_logic_vector(DATA_WIDTH - 1 downto 0)
      );
   end component;

   component QB_RAM4K_DP
      generic (
         DATA_WIDTH : integer := 8;
         ADDR_WIDTH : integer := 9
      );
      port (
         CLKA  : in    std_logic;
         ENA   : in    std_logic;
         WEA   : in    std_logic;
         ADDRA : in    std_logic_vector(ADDR_WIDTH - 1 downto 0);
         DIA   : in    std_logic_vector(DATA_WIDTH - 1 downto 0);
         DOA   : out   std_logic_vector(DATA_WIDTH - 1 downto 0);
         CLKB  : in    std_logic;
         ENB   : in    std_logic;
         WEB   : in    std_logic;
         ADDRB : in    std_logic_vector(ADDR_WIDTH - 1 downto 0);
         DIB   : in    std_logic_vector(DATA_WIDTH - 1 downto 0);
         DOB   : out   std_logic_vector(DATA_WIDTH - 1 downto 0)
      );
   end component;

   component QB_ROM4K
      generic (
         DATA_WIDTH : integer := 8;
         ADDR_WIDTH : integer := 9;
         INIT_FILE  : string := "NONE"
      );
      port (
         CLK  : in    std_logic;
         EN   : in    std_logic;
         ADDR : in    std_logic_vector(ADDR_WIDTH - 1 downto 0);
         DO   : out   std_logic_vector(DATA_WIDTH - 1 downto 0)
      );
   end component;

   component QB_FIFO512X8
      generic (
         ALMOST_FULL : integer := 504
      );
      port (
         WCLK  : in    std_logic;
         RCLK  : in    std_logic;
         RST   : in    std_logic;
         WE    : in    std_logic;
         RE    : in    std_logic;
         DI    : in    std_logic_vector(7 downto 0);
         DO    : out   std_logic_vector(7 downto 0);
         FULL  : out   std_logic;
         EMPTY : out   std_logic;
         AFULL : out   std_logic
      );
   end component;

   -- Multipliers and signal processing

   component QB_MULT18X18
      generic (
         SIGNED_MODE : boolean := true
      );
      port (
         A : in    std_logic_vector(17 downto 0);
         B : in    std_logic_vector(17 downto 0);
         P : out   std_logic_vector(35 downto 0)
      );
   end component;

   component QB_MAC18
      generic (
         SIGNED_MODE : boolean := true
      );
      port (
         CLK  : in    std_logic;
         CE   : in    std_logic;
         RST  : in    std_logic;
         LOAD : in    std_logic;
         A    : in    std_logic_vector(17 downto 0);
         B    : in    std_logic_vector(17 downto 0);
         ACC  : out   std_logic_vector(47 downto 0)
      );
   end component;

   -- Arithmetic and comparison

   component QB_ADD8
      port (
         CI : in    std_logic;
         A  : in    std_logic_vector(7 downto 0);
         B  : in    std_logic_vector(7 downto 0);
         S  : out   std_logic_vector(7 downto 0);
         CO : out   std_logic
      );
   end component;

   component QB_ADD16
      port (
         CI : in    std_logic;
         A  : in    std_logic_vector(15 downto 0);
         B  : in    std_logic_vector(15 downto 0);
         S  : out   std_logic_vector(15 downto 0);
         CO : out   std_logic
      );
   end component;

   component QB_SUB16
      port (
         BI : in    std_logic;
         A  : in    std_logic_vector(15 downto 0);
         B  : in    std_logic_vector(15 downto 0);
         D  : out   std_logic_vector(15 downto 0);
         BO : out   std_logic
      );
   end component;

   component QB_ACC16
      port (
         CLK : in    std_logic;
         CE  : in    std_logic;
         RST : in    std_logic;
         D   : in    std_logic_vector(15 downto 0);
         Q   : out   std_logic_vector(15 downto 0)
      );
   end component;

   component QB_CMP8
      generic (
         SIGNED_MODE : boolean := false
      );
      port (
         A  : in    std_logic_vector(7 downto 0);
         B  : in    std_logic_vector(7 downto 0);
         EQ : out   std_logic;
         LT : out   std_logic;
         GT : out   std_logic
      );
   end component;

   -- Counters and registers

   component QB_CNT8
      port (
         CLK  : in    std_logic;
         CE   : in    std_logic;
         RST  : in    std_logic;
         LOAD : in    std_logic;
         UP   : in    std_logic;
         D    : in    std_logic_vector(7 downto 0);
         Q    : out   std_logic_vector(7 downto 0);
         TC   : out   std_logic
      );
   end component;

   component QB_CNT16
      port (
         CLK  : in    std_logic;
         CE   : in    std_logic;
         RST  : in    std_logic;
         LOAD : in    std_logic;
         UP   : in    std_logic;
         D    : in    std_logic_vector(15 downto 0);
         Q    : out   std_logic_vector(15 downto 0);
         TC   : out   std_logic
      );
   end component;

   component QB_GRAY8
      port (
         CLK : in    std_logic;
         CE  : in    std_logic;
         RST : in    std_logic;
         Q   : out   std_logic_vector(7 downto 0)
      );
   end component;

   component QB_REG8
      generic (
         INIT : bit_vector(7 downto 0) := X"00"
      );
      port (
         CLK : in    std_logic;
         CE  : in    std_logic;
         RST : in    std_logic;
         D   : in    std_logic_vector(7 downto 0);
         Q   : out   std_logic_vector(7 downto 0)
      );
   end component;

   component QB_REG16
      generic (
         INIT : bit_vector(15 downto 0) := X"0000"
      );
      port (
         CLK : in    std_logic;
         CE  : in    std_logic;
         RST : in    std_logic;
         D   : in    std_logic_vector(15 downto 0);
         Q   : out   std_logic_vector(15 downto 0)
      );
   end component;

   component QB_SHREG8
      port (
         CLK  : in    std_logic;
         CE   : in    std_logic;
         RST  : in    std_logic;
         SI   : in    std_logic;
         LOAD : in    std_logic;
         D    : in    std_logic_vector(7 downto 0);
         Q    : out   std_logic_vector(7 downto 0);
         SO   : out   std_logic
      );
   end component;

   -- Selection and coding

   component QB_MUX8
      port (
         D : in    std_logic_vector(7 downto 0);
         S : in    std_logic_vector(2 downto 0);
         Y : out   std_logic
      );
   end component;

   component QB_MUX16
      port (
         D : in    std_logic_vector(15 downto 0);
         S : in    std_logic_vector(3 downto 0);
         Y : out   std_logic
      );
   end component;

   component QB_DEC3TO8
      port (
         EN : in    std_logic;
         A  : in    std_logic_vector(2 downto 0);
         Y  : out   std_logic_vector(7 downto 0)
      );
   end component;

   component QB_ENC8TO3
      port (
         D     : in    std_logic_vector(7 downto 0);
         Y     : out   std_logic_vector(2 downto 0);
         VALID : out   std_logic
      );
   end component;

   component QB_PARITY8
      generic (
         ODD : boolean := false
      );
      port (
         D : in    std_logic_vector(7 downto 0);
         P : out   std_logic
      );
   end component;

   -- Checksums and synchronisers

   component QB_CRC16
      generic (
         POLY : bit_vector(15 downto 0) := X"1021"
      );
      port (
         CLK : in    std_logic;
         CE  : in    std_logic;
         RST : in    std_logic;
         D   : in    std_logic_vector(7 downto 0);
         CRC : out   std_logic_vector(15 downto 0)
      );
   end component;

   component QB_SYNC2
      generic (
         STAGES : integer := 2
      );
      port (
         CLK : in    std_logic;
         D   : in    std_logic;
         Q   : out   std_logic
      );
   end component;

   component QB_PULSE_SYNC
      port (
         CLKA : in    std_logic;
         CLKB : in    std_logic;
         RST  : in    std_logic;
         PA   : in    std_logic;
         PB   : out   std_logic
      );
   end component;

   component QB_DEBOUNCE
      generic (
         COUNT : integer := 65535
      );
      port (
         CLK : in    std_logic;
         RST : in    std_logic;
         D   : in    std_logic;
         Q   : out   std_logic
      );
   end component;

end package vcomponents;
