package My_Pkg is
  constant width : integer := 4;
end package;
