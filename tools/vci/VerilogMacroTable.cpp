#include "vci/VerilogMacroTable.h"

#include <utility>

namespace Hx_Vci {

namespace {

// Two independent 64-bit hashes of the same text make the fingerprint 128 bits wide; a sum of
// per-definition hashes does not depend on the order of definition.
constexpr std::uint64_t kFnvOffset = 14695981039346656037ull;
constexpr std::uint64_t kFnvPrime = 1099511628211ull;

void Mix(std::uint64_t* fnv, std::uint64_t* mul, std::string_view text) {
  for (unsigned char c : text) {
    *fnv = (*fnv ^ c) * kFnvPrime;
    *mul = (*mul + c + 1) * 0x9E3779B97F4A7C15ull;
    *mul ^= *mul >> 29;
  }
  // A separator that no text byte sequence can imitate keeps "ab"+"c" apart from "a"+"bc".
  *fnv = (*fnv ^ 0x1ff) * kFnvPrime;
  *mul = (*mul + 0x2ff) * 0xBF58476D1CE4E5B9ull;
  *mul ^= *mul >> 31;
}

std::uint64_t Finish(std::uint64_t h) {
  h ^= h >> 33;
  h *= 0xFF51AFD7ED558CCDull;
  h ^= h >> 33;
  h *= 0xC4CEB9FE1A85EC53ull;
  h ^= h >> 33;
  return h;
}

}  // namespace

VerilogMacroTable::VerilogMacroTable(std::shared_ptr<const VerilogMacroTable> base)
    : fingerprint_(base->fingerprint_) {
  if (base->depth_ + 1 >= kMaxLayers) {
    Flatten(*base);
    return;
  }
  depth_ = base->depth_ + 1;
  base_ = std::move(base);
}

void VerilogMacroTable::Flatten(const VerilogMacroTable& table) {
  if (table.base_) {
    Flatten(*table.base_);
  }
  for (const auto& [name, macro] : table.layer_) {
    if (macro) {
      layer_.insert_or_assign(name, macro);
    } else {
      layer_.erase(name);
    }
  }
}

const VerilogMacro* VerilogMacroTable::Find(std::string_view name) const {
  for (const VerilogMacroTable* table = this; table != nullptr; table = table->base_.get()) {
    auto found = table->layer_.find(name);
    if (found != table->layer_.end()) {
      return found->second ? &*found->second : nullptr;
    }
  }
  return nullptr;
}

bool VerilogMacroTable::Define(std::string_view name, VerilogMacro macro) {
  const VerilogMacro* existing = Find(name);
  if (existing != nullptr) {
    if (*existing == macro) {
      return false;
    }
    Remove(FingerprintOf(name, *existing));
  }
  Add(FingerprintOf(name, macro));
  auto found = layer_.find(name);
  if (found != layer_.end()) {
    found->second = std::move(macro);
  } else {
    layer_.emplace(std::string(name), std::move(macro));
  }
  return true;
}

bool VerilogMacroTable::Undefine(std::string_view name) {
  const VerilogMacro* existing = Find(name);
  if (existing == nullptr) {
    return false;
  }
  Remove(FingerprintOf(name, *existing));
  auto found = layer_.find(name);
  if (!base_) {
    layer_.erase(found);
  } else if (found != layer_.end()) {
    found->second.reset();
  } else {
    layer_.emplace(std::string(name), std::nullopt);
  }
  return true;
}

VerilogMacroFingerprint VerilogMacroTable::FingerprintOf(std::string_view name, const VerilogMacro& macro) {
  std::uint64_t fnv = kFnvOffset;
  std::uint64_t mul = 0x243F6A8885A308D3ull;
  Mix(&fnv, &mul, name);
  Mix(&fnv, &mul, macro.hasParameters ? "(" : "");
  for (std::size_t i = 0; i < macro.parameters.size(); ++i) {
    Mix(&fnv, &mul, macro.parameters[i]);
    Mix(&fnv, &mul, i < macro.defaults.size() ? macro.defaults[i] : std::string_view());
  }
  Mix(&fnv, &mul, macro.body);
  return {Finish(fnv), Finish(mul)};
}

void VerilogMacroTable::Add(const VerilogMacroFingerprint& part) {
  fingerprint_.low += part.low;
  fingerprint_.high += part.high;
}

void VerilogMacroTable::Remove(const VerilogMacroFingerprint& part) {
  fingerprint_.low -= part.low;
  fingerprint_.high -= part.high;
}

}  // namespace Hx_Vci
