architecture rtl of leaf is
begin
end architecture rtl;
