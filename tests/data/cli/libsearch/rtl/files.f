// Paths relative to this list (-F).
top.v counter.v   # two on a line
-y ../lib +libext+.v
-v "../cells/cells.v"
