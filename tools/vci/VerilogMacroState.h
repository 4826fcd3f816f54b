// The macro table that one file's preprocessing works on. It starts as a shared, unchangeable
// table; a layer of its own is put on top only when the file changes a definition, so files that
// define nothing (most of them) hand the very same table on.
#pragma once

#include <memory>
#include <string_view>

#include "vci/VerilogMacroTable.h"

namespace Hx_Vci {

class VerilogMacroState {
 public:
  // `start` must not be null.
  explicit VerilogMacroState(std::shared_ptr<const VerilogMacroTable> start);

  const VerilogMacro* Find(std::string_view name) const { return current_->Find(name); }
  void Define(std::string_view name, VerilogMacro macro);
  void Undefine(std::string_view name);
  // Forgets every definition, those of the command line too.
  void UndefineAll();

  // The table as it stands now; later changes to this state do not reach it.
  std::shared_ptr<const VerilogMacroTable> Snapshot();

 private:
  VerilogMacroTable& Writable();

  std::shared_ptr<const VerilogMacroTable> current_;
  // Set while current_ is a private copy that no snapshot shares yet.
  std::shared_ptr<VerilogMacroTable> writable_;
};

}  // namespace Hx_Vci
