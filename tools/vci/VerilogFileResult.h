// What compiling one file yields: plain values only (no counted objects), so that a result can be
// kept in a cache shared by compilers and handed to any number of later compiles.
#pragma once

#include <cstddef>
#include <memory>
#include <vector>

#include "vci/VerilogDesignInfo.h"
#include "vci/VerilogMacroTable.h"
#include "vci/VerilogMessage.h"
#include "vci/VerilogPreprocessedText.h"

namespace Hx_Vci {

struct VerilogFileResult {
  bool readable = false;  // false: the file could not be read and nothing else is set but messages
  std::shared_ptr<const VerilogMacroTable> macrosAfter;  // the macro state the next file starts with
  std::vector<VerilogModuleInfo> modules;
  // The user-defined primitives declared in the file: their instances are no module instances.
  std::vector<std::string> primitives;
  std::vector<VerilogMessage> messages;
  std::vector<VerilogDependency> dependencies;

  // Memory held, roughly, leaving out the shared macro table.
  std::size_t ApproximateBytes() const;
};

}  // namespace Hx_Vci
