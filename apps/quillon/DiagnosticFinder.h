// Finds what makes a design broken or incomplete from what the module hands out: the records of
// every file (with file and line), the hierarchy tree and the compile order.
//
// Errors: an entity instance or a package of a use clause missing from a library the project
// has; a library or use clause naming a library the project does not have (unless external);
// two units of one name in one library; files that use each other through entities or packages
// so that no valid order exists; a VHDL or Verilog file in which nothing was found.
// Warnings (errors when strict): component and module instances of units the project does not
// have and the cell libraries do not know (black boxes).
#pragma once

#include <set>
#include <string>
#include <vector>

#include "DesignModel.h"
#include "Diagnostic.h"

namespace quillon {

class DiagnosticFinder {
 public:
  struct Settings {
    std::set<std::string> externalLibraries;  // lower case; their units are black boxes
    bool strict = false;                      // black boxes are errors
  };

  explicit DiagnosticFinder(Settings settings);

  // In file order, each file's findings in record order; then the order findings. `tree` and
  // `order` may be null when they are not available.
  std::vector<Diagnostic> Find(const std::vector<FileInfo>& files, const TreeInfo* tree,
                               const std::vector<OrderEntry>* order) const;

 private:
  Settings settings_;
};

}  // namespace quillon
