package pkg is
end package;
