entity vh is
end entity;
architecture rtl of vh is
begin
end architecture;
