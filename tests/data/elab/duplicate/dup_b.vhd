-- The same entity again, in the same library.
entity dup is
end entity dup;

architecture b of dup is
begin
end architecture b;
