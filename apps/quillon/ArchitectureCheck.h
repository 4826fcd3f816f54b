// The warning of `check` for an entity with several architectures: an instance that names none
// is bound to the one analysed last, which the compile order places after the others.
#pragma once

#include <string>
#include <vector>

#include "DesignModel.h"
#include "Diagnostic.h"
#include "ShownPaths.h"

namespace quillon {

class ArchitectureCheck {
 public:
  // One warning per entity (by library) with more than one architecture, naming each with its file
  // and line and the one bound by default: its file comes last in `order`, within one file the
  // one further down. The text names the files as `shown` gives them (full paths without it).
  static std::vector<Diagnostic> Find(const std::vector<FileInfo>& files,
                                      const std::vector<OrderEntry>& order,
                                      const ShownPaths* shown = nullptr);
};

}  // namespace quillon
