entity dup is
end entity dup;

architecture a of dup is
begin
end architecture a;
