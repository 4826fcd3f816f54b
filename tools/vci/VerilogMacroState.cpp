#include "vci/VerilogMacroState.h"

#include <utility>

namespace Hx_Vci {

VerilogMacroState::VerilogMacroState(std::shared_ptr<const VerilogMacroTable> start)
    : current_(std::move(start)) {}

void VerilogMacroState::Define(std::string_view name, VerilogMacro macro) {
  const VerilogMacro* existing = current_->Find(name);
  if (existing != nullptr && *existing == macro) {
    return;
  }
  Writable().Define(name, std::move(macro));
}

void VerilogMacroState::Undefine(std::string_view name) {
  if (current_->Find(name) != nullptr) {
    Writable().Undefine(name);
  }
}

void VerilogMacroState::UndefineAll() {
  writable_ = std::make_shared<VerilogMacroTable>();
  current_ = writable_;
}

std::shared_ptr<const VerilogMacroTable> VerilogMacroState::Snapshot() {
  writable_.reset();
  return current_;
}

VerilogMacroTable& VerilogMacroState::Writable() {
  if (!writable_) {
    writable_ = std::make_shared<VerilogMacroTable>(current_);
    current_ = writable_;
  }
  return *writable_;
}

}  // namespace Hx_Vci
