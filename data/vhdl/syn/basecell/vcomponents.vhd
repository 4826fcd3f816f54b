-- Component declarations of a Quillon sample cell library. The cells and their names are our own;
-- they exist so that instances of library cells are recognised without any installation.
--
-- basecell: the unified cell library (gates, flip-flops, latches, I/O buffers, small memories,
-- clock managers).

library ieee;
use ieee.std_logic_1164.all;

package vcomponents is

   -- Constant drivers

   component QL_TIEHI
      port (
         Y : out   std_logic
      );
   end component;

   component QL_TIELO
      port (
         Y : out   std_logic
      );
   end component;

   -- Logic gates and multiplexers

   component QL_INV
      port (
         A : in    std_logic;
         Y : out   std_logic
      );
   end component;

   component QL_BUF
      port (
         A : in    std_logic;
         Y : out   std_logic
      );
   end component;

   component QL_AND2
      port (
         A : in    std_logic;
         B : in    std_logic;
         Y : out   std_logic
      );
   end component;

   component QL_AND3
      port (
         A : in    std_logic;
         B : in    std_logic;
         C : in    std_logic;
         Y : out   std_logic
      );
   end component;

   component QL_AND4
      port (
         A : in    std_logic;
         B : in    std_logic;
         C : in    std_logic;
         D : in    std_logic;
         Y : out   std_logic
      );
   end component;

   component QL_NAND2
      port (
         A : in    std_logic;
         B : in    std_logic;
         Y : out   std_logic
      );
   end component;

   component QL_NAND3
      port (
         A : in    std_logic;
         B : in    std_logic;
         C : in    std_logic;
         Y : out   std_logic
      );
   end component;

   component QL_OR2
      port (
         A : in    std_logic;
         B : in    std_logic;
         Y : out   std_logic
      );
   end component;

   component QL_OR3
      port (
         A : in    std_logic;
         B : in    std_logic;
         C : in    std_logic;
         Y : out   std_logic
      );
   end component;

   component QL_OR4
      port (
         A : in    std_logic;
         B : in    std_logic;
         C : in    std_logic;
         D : in    std_logic;
         Y : out   std_logic
      );
   end component;

   component QL_NOR2
      port (
         A : in    std_logic;
         B : in    std_logic;
         Y : out   std_logic
      );
   end component;

   component QL_NOR3
      port (
         A : in    std_logic;
         B : in    std_logic;
         C : in    std_logic;
         Y : out   std_logic
      );
   end component;

   component QL_XOR2
      port (
         A : in    std_logic;
         B : in    std_logic;
         Y : out   std_logic
      );
   end component;

   component QL_XNOR2
      port (
         A : in    std_logic;
         B : in    std_logic;
         Y : out   std_logic
      );
   end component;

   component QL_MUX2
      port (
         D0 : in    std_logic;
         D1 : in    std_logic;
         S  : in    std_logic;
         Y  : out   std_logic
      );
   end component;

   component QL_MUX4
      port (
         D0 : in    std_logic;
         D1 : in    std_logic;
         D2 : in    std_logic;
         D3 : in    std_logic;
         S0 : in    std_logic;
         S1 : in    std_logic;
         Y  : out   std_logic
      );
   end component;

   -- Look-up tables

   component QL_LUT2
      generic (
         INIT : bit_vector(3 downto 0) := X"0"
      );
      port (
         I0 : in    std_logic;
         I1 : in    std_logic;
         O  : out   std_logic
      );
   end component;

   component QL_LUT3
      generic (
         INIT : bit_vector(7 downto 0) := X"00"
      );
      port (
         I0 : in    std_logic;
         I1 : in    std_logic;
         I2 : in    std_logic;
         O  : out   std_logic
      );
   end component;

   component QL_LUT4
      generic (
         INIT : bit_vector(15 downto 0) := X"0000"
      );
      port (
         I0 : in    std_logic;
         I1 : in    std_logic;
         I2 : in    std_logic;
         I3 : in    std_logic;
         O  : out   std_logic
      );
   end component;

   -- Flip-flops (rising edge unless named N; R/S asynchronous, E clock enable)

   component QL_DFF
      generic (
         INIT : bit := '0'
      );
      port (
         D   : in    std_logic;
         CLK : in    std_logic;
         Q   : out   std_logic
      );
   end component;

   component QL_DFFN
      generic (
         INIT : bit := '0'
      );
      port (
         D   : in    std_logic;
         CLK : in    std_logic;
         Q   : out   std_logic
      );
   end component;

   component QL_DFFE
      generic (
         INIT : bit := '0'
      );
      port (
         D   : in    std_logic;
         CLK : in    std_logic;
         E   : in    std_logic;
         Q   : out   std_logic
      );
   end component;

   component QL_DFFR
      generic (
         INIT : bit := '0'
      );
      port (
         D   : in    std_logic;
         CLK : in    std_logic;
         R   : in    std_logic;
         Q   : out   std_logic
      );
   end component;

   component QL_DFFS
      generic (
         INIT : bit := '1'
      );
      port (
         D   : in    std_logic;
         CLK : in    std_logic;
         S   : in    std_logic;
         Q   : out   std_logic
      );
   end component;

   component QL_DFFRE
      generic (
         INIT : bit := '0'
      );
      port (
         D   : in    std_logic;
         CLK : in    std_logic;
         E   : in    std_logic;
         R   : in    std_logic;
         Q   : out   std_logic
      );
   end component;

   component QL_DFFSE
      generic (
         INIT : bit := '1'
      );
      port (
         D   : in    std_logic;
         CLK : in    std_logic;
         E   : in    std_logic;
         S   : in    std_logic;
         Q   : out   std_logic
      );
   end component;

   -- Latches (transparent while G is high)

   component QL_LATCH
      generic (
         INIT : bit := '0'
      );
      port (
         D : in    std_logic;
         G : in    std_logic;
         Q : out   std_logic
      );
   end component;

   component QL_LATCHR
      generic (
         INIT : bit := '0'
      );
      port (
         D : in    std_logic;
         G : in    std_logic;
         R : in    std_logic;
         Q : out   std_logic
      );
   end component;

   -- Arithmetic

   component QL_HADD
      port (
         A  : in    std_logic;
         B  : in    std_logic;
         S  : out   std_logic;
         CO : out   std_logic
      );
   end component;

   component QL_FADD
      port (
         A  : in    std_logic;
         B  : in    std_logic;
         CI : in    std_logic;
         S  : out   std_logic;
         CO : out   std_logic
      );
   end component;

   component QL_CARRY4
      port (
         CI : in    std_logic;
         DI : in    std_logic_vector(3 downto 0);
         S  : in    std_logic_vector(3 downto 0);
         O  : out   std_logic_vector(3 downto 0);
         CO : out   std_logic_vector(3 downto 0)
      );
   end component;

   -- Clock and three-state buffers

   component QL_GBUF
      port (
         I : in    std_logic;
         O : out   std_logic
      );
   end component;

   component QL_TBUF
      port (
         I : in    std_logic;
         T : in    std_logic;
         O : out   std_logic
      );
   end component;

   -- I/O buffers

   component QL_IBUF
      generic (
         IOSTANDARD : string := "DEFAULT"
      );
      port (
         I : in    std_logic;
         O : out   std_logic
      );
   end component;

   component QL_OBUF
      generic (
         IOSTANDARD : string := "DEFAULT";
         DRIVE      : integer := 8;
         SLEW       : string := "SLOW"
      );
      port (
         I : in    std_logic;
         O : out   std_logic
      );
   end component;

   component QL_OBUFT
      generic (
         IOSTANDARD : string := "DEFAULT";
         DRIVE      : integer := 8;
         SLEW       : string := "SLOW"
      );
      port (
         I : in    std_logic;
         T : in    std_logic;
         O : out   std_logic
      );
   end component;

   component QL_IOBUF
      generic (
         IOSTANDARD : string := "DEFAULT";
         DRIVE      : integer := 8;
         SLEW       : string := "SLOW"
      );
      port (
         I  : in    std_logic;
         T  : in    std_logic;
         O  : out   std_logic;
         IO : inout std_logic
      );
   end component;

   component QL_IBUFDS
      generic (
         IOSTANDARD : string := "DEFAULT";
         DIFF_TERM  : boolean := false
      );
      port (
         I  : in    std_logic;
         IB : in    std_logic;
         O  : out   std_logic
      );
   end component;

   component QL_OBUFDS
      generic (
         IOSTANDARD : string := "DEFAULT"
      );
      port (
         I  : in    std_logic;
         O  : out   std_logic;
         OB : out   std_logic
      );
   end component;

   -- Distributed memory and shift registers

   component QL_RAM16X1S
      generic (
         INIT : bit_vector(15 downto 0) := X"0000"
      );
      port (
         D    : in    std_logic;
         WE   : in    std_logic;
         WCLK : in    std_logic;
         A    : in    std_logic_vector(3 downto 0);
         O    : out   std_logic
      );
   end component;

   component QL_RAM16X1D
      generic (
         INIT : bit_vector(15 downto 0) := X"0000"
      );
      port (
         D    : in    std_logic;
         WE   : in    std_logic;
         WCLK : in    std_logic;
         A    : in    std_logic_vector(3 downto 0);
         DPRA : in    std_logic_vector(3 downto 0);
         SPO  : out   std_logic;
         DPO  : out   std_logic
      );
   end component;

   component QL_ROM32X1
      generic (
         INIT : bit_vector(31 downto 0) := X"00000000"
      );
      port (
         A : in    std_logic_vector(4 downto 0);
         O : out   std_logic
      );
   end component;

   component QL_SRL16E
      generic (
         INIT : bit_vector(15 downto 0) := X"0000"
      );
      port (
         D   : in    std_logic;
         CE  : in    std_logic;
         CLK : in    std_logic;
         A   : in    std_logic_vector(3 downto 0);
         Q   : out   std_logic
      );
   end component;

   -- Clock managers and oscillators

   component QL_PLL
      generic (
         CLKIN_PERIOD : real := 10.0;
         MULT         : integer := 4;
         DIV0         : integer := 4;
         DIV1         : integer := 4
      );
      port (
         CLKIN    : in    std_logic;
         CLKFB    : in    std_logic;
         RST      : in    std_logic;
         CLKOUT0  : out   std_logic;
         CLKOUT1  : out   std_logic;
         CLKFBOUT : out   std_logic;
         LOCKED   : out   std_logic
      );
   end component;

   component QL_CLKDIV
      generic (
         DIVIDE : integer := 2
      );
      port (
         CLKI : in    std_logic;
         RST  : in    std_logic;
         CLKO : out   std_logic
      );
   end component;

   component QL_OSC
      generic (
         FREQ_MHZ : real := 48.0
      );
      port (
         EN   : in    std_logic;
         CLKO : out   std_logic
      );
   end component;

end package vcomponents;
