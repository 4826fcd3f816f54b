package sizes_pkg is
  constant LANES : integer := 4;
end package sizes_pkg;
