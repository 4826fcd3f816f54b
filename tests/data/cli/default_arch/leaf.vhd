entity leaf is
end entity;
