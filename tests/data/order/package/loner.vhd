-- Uses nothing and is used by nobody.
entity loner is
  port (clk : in bit);
end entity loner;

architecture rtl of loner is
begin
end architecture rtl;
