package shared is
  constant DEPTH : natural := 16;
end package shared;
