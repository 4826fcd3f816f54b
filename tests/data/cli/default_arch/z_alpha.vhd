architecture alpha of leaf is
begin
end architecture;
