// Writes an export plan in the format that `quillon export --to` names.
#pragma once

#include <ostream>
#include <string>
#include <string_view>

#include "ExportModel.h"

namespace quillon {

class ExportWriter {
 public:
  // format: make, ninja, depfile, ghdl, iverilog, edam or tcl. False, with the reason in `error`,
  // when the format cannot carry a path or value of the plan (or the format is unknown).
  static bool Write(std::string_view format, const ExportPlan& plan, std::ostream& out, std::string& error);
};

}  // namespace quillon
