architecture late of leaf is
begin
end architecture;
