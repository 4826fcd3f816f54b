entity stray is
  port (a : in bit; b : out bit);
end entity stray;

architecture rtl of stray is
  component mystery_block is
    port (a : in bit; b : out bit);
  end component;
begin
  u_mystery : mystery_block port map (a => a, b => b);
end architecture rtl;
