entity leaf is
end entity;
architecture first of leaf is
begin
end architecture;
architecture second of leaf is
begin
end architecture;
