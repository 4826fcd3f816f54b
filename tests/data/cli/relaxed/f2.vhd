entity b is
end entity;
