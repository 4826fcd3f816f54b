// The text macros defined at one point of a compilation, with a fingerprint of the whole set that
// is kept up to date with every change, so that two macro states compare in constant time.
//
// A table is a layer over an unchangeable base table and holds only the changes made on top of
// it, so that the macro state after every file of a project can be kept without copying all
// earlier definitions each time; a chain that grows deep is flattened into a new root.
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace Hx_Vci {

struct VerilogMacro {
  bool hasParameters = false;
  std::vector<std::string> parameters;
  // Default text per parameter (empty when none), as long as `parameters`.
  std::vector<std::string> defaults;
  std::string body;

  bool operator==(const VerilogMacro&) const = default;
};

struct VerilogMacroFingerprint {
  std::uint64_t low = 0;
  std::uint64_t high = 0;

  bool operator==(const VerilogMacroFingerprint&) const = default;
};

class VerilogMacroTable {
 public:
  static constexpr int kMaxLayers = 32;

  VerilogMacroTable() = default;
  // A new layer holding the same definitions as `base` (not null), which is never changed.
  explicit VerilogMacroTable(std::shared_ptr<const VerilogMacroTable> base);

  // Null when `name` is not defined.
  const VerilogMacro* Find(std::string_view name) const;
  // False when the same definition was there already, so nothing changed.
  bool Define(std::string_view name, VerilogMacro macro);
  // False when `name` was not defined.
  bool Undefine(std::string_view name);

  // Equal for equal sets of definitions, whatever the order in which they were made.
  const VerilogMacroFingerprint& fingerprint() const { return fingerprint_; }

 private:
  struct NameHash {
    using is_transparent = void;
    std::size_t operator()(std::string_view name) const { return std::hash<std::string_view>()(name); }
  };
  // A name's entry in a layer: its definition, or none when the layer undefined it.
  using Layer = std::unordered_map<std::string, std::optional<VerilogMacro>, NameHash, std::equal_to<>>;

  static VerilogMacroFingerprint FingerprintOf(std::string_view name, const VerilogMacro& macro);
  void Add(const VerilogMacroFingerprint& part);
  void Remove(const VerilogMacroFingerprint& part);
  void Flatten(const VerilogMacroTable& table);

  std::shared_ptr<const VerilogMacroTable> base_;
  Layer layer_;
  int depth_ = 0;  // layers below this one
  VerilogMacroFingerprint fingerprint_;
};

}  // namespace Hx_Vci
