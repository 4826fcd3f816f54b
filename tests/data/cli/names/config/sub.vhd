entity Sub is
end entity;
architecture Rtl of Sub is
begin
end architecture;
