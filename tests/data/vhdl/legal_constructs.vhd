-- Legal VHDL-93 and VHDL-2008 whose nesting the syntax check follows: every construct that
-- "end" closes, the forms that look like them but are not closed, and character literals that
-- hold quotes, parentheses and backslashes.
library ieee;
use ieee.std_logic_1164.all;
context ctx is
  library ieee;
  use ieee.std_logic_1164.all;
  context work.other;
end context ctx;

package gp is
  generic (type t; function f (a : t) return t is <>; package ip is new work.g generic map (<>));
  function id (a : t) return t;
  procedure p (signal s : in bit);
  type state is (idle, run);
  type rec is record
    a : bit;
    b : integer;
  end record rec;
  type dist is range 0 to 1000 units um; mm = 1000 um; end units;
  type prot is protected
    procedure inc;
    impure function get return integer;
  end protected prot;
  component comp is
    port (x : in bit);
  end component;
  attribute keep : string;
  attribute keep of comp : component is "yes";
  attribute marks of all : entity is "e";
  alias al is id [t return t];
  function "+" (a, b : state) return state;
end package gp;

package body gp is
  function id (a : t) return t is begin return a; end function id;
  procedure p (signal s : in bit) is begin null; end procedure;
  type prot is protected body
    variable n : integer := 0;
    procedure inc is begin n := n + 1; end procedure;
    impure function get return integer is begin return n; end function;
  end protected body prot;
  function "+" (a, b : state) return state is begin return a; end "+";
end package body gp;

package inst is new work.gp generic map (t => bit, ip => work.other_inst);

entity e is
  generic (n : integer := 4);
  port (clk : in std_logic; d : in std_logic_vector(n-1 downto 0); q : out std_logic);
  attribute a of e : entity is "x";
begin
  assert n > 0 report "bad" severity failure;
end entity e;

architecture rtl of e is
  signal s, t : std_logic := '0';
  signal c : character := '(';
  signal c2 : character := ')';
  signal c3 : character := '"';
  signal c4 : character := '\';
  signal str : string(1 to 3) := "a;b";
  constant k : std_logic_vector := std_logic_vector'("0101");
  constant ch : character := character'('x');
  function f return integer is begin return 1; end;
  procedure pr is new work.gen_proc generic map (t => bit);
  for all : comp use entity work.sub(rtl);
  for u3 : comp use entity work.sub; end for;
  package local is
    constant z : integer := 0;
  end package;
  package local2 is new work.gp generic map (t => integer);
begin
  p1 : process (clk)
    variable v : integer;
  begin
    if rising_edge(clk) then
      if s = '1' then q <= '0'; elsif s = ')' then q <= '1'; else q <= 'Z'; end if;
      case d is
        when "00" => v := 1;
        when others => null;
      end case;
      for i in 0 to 3 loop
        exit when i = 2;
      end loop;
      while v < 3 loop v := v + 1; end loop;
      l: loop exit; end loop l;
      str <= str(1 to 2) & '(';
      report "x" & ')' & "y";
    end if;
  end process p1;
  postponed process begin wait; end postponed process;
  u1 : comp port map (x => s);
  u2 : entity work.sub(rtl) port map (clk, s);
  u4 : configuration work.cfg;
  u5 : component comp;
  b1 : block (clk = '1') is
    signal w : bit;
  begin
    w <= guarded '1';
  end block b1;
  g1 : for i in 0 to 3 generate
    u : comp port map (x => s);
  end generate g1;
  g2 : if n > 2 generate
    s <= '1';
  elsif n > 1 generate
    s <= '0';
  else generate
    s <= 'Z';
  end generate;
  g3 : if a1: n > 2 generate
    signal z : bit;
  begin
    z <= '1';
  end a1;
  else a2: generate
  end a2;
  end generate g3;
  g4 : case n generate
    when 1 => s <= '1';
    when others => s <= '0';
  end generate;
  t <= '1' when s = '0' else '0';
  with s select t <= '1' when '0', '0' when others;
end architecture rtl;

configuration cfg of e is
  for rtl
    for u1 : comp
      use entity work.sub(rtl) generic map (n => 2);
    end for;
    for g1(0)
      for u : comp use configuration work.subcfg; end for;
    end for;
  end for;
end configuration cfg;
