package \Tab\ is
end package;
