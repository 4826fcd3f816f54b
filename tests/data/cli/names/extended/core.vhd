entity \Core\ is
end entity;
entity \CORE\ is
end entity;
