// The Tcl export: plain Tcl lists that any tool's script can walk, without tool commands.
//   set quillon_files {{LIBRARY PATH LANGUAGE} ...}   LANGUAGE: vhdl, verilog or systemverilog
//   set quillon_incdirs {DIR ...}
//   set quillon_defines {NAME[=VALUE] ...}
//   set quillon_top {LIBRARY NAME [ARCHITECTURE]}      empty without a top
#pragma once

#include <ostream>
#include <string>
#include <string_view>

#include "ExportModel.h"

namespace quillon {

class TclWriter {
 public:
  static void Write(const ExportPlan& plan, std::ostream& out);

  // `text` as one element of a Tcl list: special characters escaped with a backslash.
  static std::string ListElement(std::string_view text);
};

}  // namespace quillon
