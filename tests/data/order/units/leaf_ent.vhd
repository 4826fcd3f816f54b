use work.util.all;
entity leaf is
  port (clk : in bit);
end entity leaf;
