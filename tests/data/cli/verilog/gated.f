+define+FROM_COMMAND_LINE
+incdir+include
gated.v
