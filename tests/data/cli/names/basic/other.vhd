entity Other is
end entity;
