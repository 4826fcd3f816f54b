entity always_there is
end entity always_there;

-- synthesis translate_off
entity model_only is
end entity model_only;
-- synthesis translate_on
