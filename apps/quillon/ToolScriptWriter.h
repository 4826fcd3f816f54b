// The simulator exports: a POSIX sh script that analyses the VHDL sources with GHDL, and a
// command file for Icarus Verilog (iverilog -c FILE) listing the Verilog sources. Sources of the
// other language are named in comments only.
#pragma once

#include <ostream>
#include <string>

#include "ExportModel.h"

namespace quillon {

class ToolScriptWriter {
 public:
  // Analyses every VHDL source into its library (one work directory, WORKDIR, for all of them)
  // and elaborates the top when it is a VHDL unit. GHDL, GHDL_FLAGS and WORKDIR may be
  // set in the environment.
  static bool Ghdl(const ExportPlan& plan, std::ostream& out, std::string& error);
  // +incdir+ and +define+ lines, then the Verilog sources in order; the top, which a command
  // file cannot carry, is named in the leading comment as the -s argument. False, with the
  // reason, for a path, directory or macro that holds a blank (or a '+' in a directory or
  // macro), which the command file would split.
  static bool Iverilog(const ExportPlan& plan, std::ostream& out, std::string& error);
};

}  // namespace quillon
