package util is
  constant RESET_LEVEL : bit := '0';
end package util;
