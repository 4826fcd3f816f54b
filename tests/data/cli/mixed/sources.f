# The mixed project as a file list; paths are taken from the current directory.
+define+WIDTH=8+FAST
+incdir+include
shared_pkg.vhd   // the package
lane.vhd

// the rest
core.vhd
top.vhd
readme.notes
