use work.\Tab\.all;
entity exact is
end entity;
