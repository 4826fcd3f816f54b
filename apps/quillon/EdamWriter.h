// The EDAM export: the JSON description of a design that tool-flow runners read (name, files
// with type and library, toplevel, parameters).
#pragma once

#include <ostream>
#include <string>
#include <vector>

#include "ExportModel.h"

namespace quillon {

class EdamWriter {
 public:
  // EDAM has no list of include directories: it carries them as include files. The header files
  // (kHeaderExtensions) of every include directory are listed with "is_include_file": true and
  // their directory as "include_path". Macros are parameters of type "vlogdefine".
  static void Write(const ExportPlan& plan, std::ostream& out);

  static const std::vector<std::string>& HeaderExtensions();
};

}  // namespace quillon
