use work.\TAB\.all;
entity folded is
end entity;
