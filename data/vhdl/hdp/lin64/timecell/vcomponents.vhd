-- Component declarations of a Quillon sample cell library. The cells and their names are our own;
-- they exist so that instances of library cells are recognised without any installation.
--
-- timecell: the timing primitives that simulation netlists instantiate.

library ieee;
use ieee.std_logic_1164.all;

package vcomponents is

   -- Combinational primitives

   component QT_ZERO
      port (
         Y : out   std_logic
      );
   end component;

   component QT_ONE
      port (
         Y : out   std_logic
      );
   end component;

   component QT_BUF
      generic (
         TPD_A_Y : time := 0 ns
      );
      port (
         A : in    std_logic;
         Y : out   std_logic
      );
   end component;

   component QT_INV
      generic (
         TPD_A_Y : time := 0 ns
      );
      port (
         A : in    std_logic;
         Y : out   std_logic
      );
   end component;

   component QT_AND2
      generic (
         TPD_A_Y : time := 0 ns;
         TPD_B_Y : time := 0 ns
      );
      port (
         A : in    std_logic;
         B : in    std_logic;
         Y : out   std_logic
      );
   end component;

   component QT_OR2
      generic (
         TPD_A_Y : time := 0 ns;
         TPD_B_Y : time := 0 ns
      );
      port (
         A : in    std_logic;
         B : in    std_logic;
         Y : out   std_logic
      );
   end component;

   component QT_XOR2
      generic (
         TPD_A_Y : time := 0 ns;
         TPD_B_Y : time := 0 ns
      );
      port (
         A : in    std_logic;
         B : in    std_logic;
         Y : out   std_logic
      );
   end component;

   component QT_MUX2
      generic (
         TPD_D0_Y : time := 0 ns;
         TPD_D1_Y : time := 0 ns;
         TPD_S_Y  : time := 0 ns
      );
      port (
         D0 : in    std_logic;
         D1 : in    std_logic;
         S  : in    std_logic;
         Y  : out   std_logic
      );
   end component;

   component QT_LUT4
      generic (
         INIT    : bit_vector(15 downto 0) := X"0000";
         TPD_I_O : time := 0 ns
      );
      port (
         I0 : in    std_logic;
         I1 : in    std_logic;
         I2 : in    std_logic;
         I3 : in    std_logic;
         O  : out   std_logic
      );
   end component;

   component QT_CARRY
      generic (
         TPD_CI_CO : time := 0 ns;
         TPD_CI_S  : time := 0 ns
      );
      port (
         A  : in    std_logic;
         B  : in    std_logic;
         CI : in    std_logic;
         S  : out   std_logic;
         CO : out   std_logic
      );
   end component;

   -- Sequential primitives

   component QT_FF
      generic (
         TSETUP_D_CLK : time := 0 ns;
         THOLD_D_CLK  : time := 0 ns;
         TPD_CLK_Q    : time := 0 ns;
         INIT         : std_logic := '0'
      );
      port (
         D   : in    std_logic;
         CLK : in    std_logic;
         SR  : in    std_logic;
         CE  : in    std_logic;
         Q   : out   std_logic
      );
   end component;

   component QT_LATCH
      generic (
         TPD_G_Q : time := 0 ns;
         INIT    : std_logic := '0'
      );
      port (
         D  : in    std_logic;
         G  : in    std_logic;
         SR : in    std_logic;
         Q  : out   std_logic
      );
   end component;

   component QT_SRL
      generic (
         TSETUP_D_CLK : time := 0 ns;
         THOLD_D_CLK  : time := 0 ns;
         TPD_CLK_Q    : time := 0 ns;
         INIT         : bit_vector(15 downto 0) := X"0000"
      );
      port (
         D   : in    std_logic;
         CLK : in    std_logic;
         CE  : in    std_logic;
         A   : in    std_logic_vector(3 downto 0);
         Q   : out   std_logic
      );
   end component;

   -- Memory primitives

   component QT_RAMBIT
      generic (
         TPD_A_O : time := 0 ns;
         INIT    : bit := '0'
      );
      port (
         D    : in    std_logic;
         WE   : in    std_logic;
         WCLK : in    std_logic;
         A    : in    std_logic_vector(3 downto 0);
         O    : out   std_logic
      );
   end component;

   component QT_RAMBLOCK
      generic (
         DATA_WIDTH : integer := 8;
         ADDR_WIDTH : integer := 9;
         TPD_CLK_DO : time := 0 ns
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

   component QT_MULT
      generic (
         A_WIDTH : integer := 18;
         B_WIDTH : integer := 18;
         TPD_A_P : time := 0 ns
      );
      port (
         A : in    std_logic_vector(A_WIDTH - 1 downto 0);
         B : in    std_logic_vector(B_WIDTH - 1 downto 0);
         P : out   std_logic_vector(A_WIDTH + B_WIDTH - 1 downto 0)
      );
   end component;

   -- Pads, pulls and keepers

   component QT_IPAD
      generic (
         TPD_PAD_Y : time := 0 ns
      );
      port (
         PAD : in    std_logic;
         Y   : out   std_logic
      );
   end component;

   component QT_OPAD
      generic (
         TPD_A_PAD : time := 0 ns
      );
      port (
         A   : in    std_logic;
         PAD : out   std_logic
      );
   end component;

   component QT_IOPAD
      generic (
         TPD_A_PAD : time := 0 ns;
         TPD_PAD_Y : time := 0 ns
      );
      port (
         A   : in    std_logic;
         OE  : in    std_logic;
         Y   : out   std_logic;
         PAD : inout std_logic
      );
   end component;

   component QT_PULLUP
      port (
         PAD : inout std_logic
      );
   end component;

   component QT_PULLDOWN
      port (
         PAD : inout std_logic
      );
   end component;

   component QT_KEEPER
      port (
         PAD : inout std_logic
      );
   end component;

   -- Clocks and interconnect delays

   component QT_CLKBUF
      generic (
         TPD_I_O : time := 0 ns
      );
      port (
         I : in    std_logic;
         O : out   std_logic
      );
   end component;

   component QT_PLL
      generic (
         CLKIN_PERIOD : real := 10.0;
         MULT         : integer := 4;
         DIV0         : integer := 4;
         LOCK_TIME    : time := 10 us
      );
      port (
         CLKIN    : in    std_logic;
         CLKFB    : in    std_logic;
         RST      : in    std_logic;
         CLKOUT0  : out   std_logic;
         CLKFBOUT : out   std_logic;
         LOCKED   : out   std_logic
      );
   end component;

   component QT_OSC
      generic (
         PERIOD : time := 20.833 ns
      );
      port (
         EN   : in    std_logic;
         CLKO : out   std_logic
      );
   end component;

   component QT_WIREDELAY
      generic (
         DELAY : time := 0 ns
      );
      port (
         I : in    std_logic;
         O : out   std_logic
      );
   end component;

   component QT_PATHDELAY
      generic (
         RISE : time := 0 ns;
         FALL : time := 0 ns
      );
      port (
         I : in    std_logic;
         O : out   std_logic
      );
   end component;

end package vcomponents;
