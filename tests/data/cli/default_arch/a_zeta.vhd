architecture zeta of leaf is
begin
end architecture;
