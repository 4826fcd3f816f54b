// The units the loader has read, by library directory and unit name. An entry stays valid while
// the directory's sources keep their names, sizes and modification times; the least recently used
// entry makes room when kMaxUnits are kept.
#pragma once

#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "rudiva/RudIva_Node.h"

class RudIva_UnitCache {
 public:
  struct SourceFile {
    std::string name;
    std::uintmax_t size = 0;
    std::filesystem::file_time_type modified;

    bool operator==(const SourceFile&) const = default;
  };
  using Sources = std::vector<SourceFile>;

  static constexpr std::size_t kMaxUnits = 16;

  // The VHDL sources (".vhd", ".vhdl", ".vho", any letter case) of a directory in byte order of
  // their names; regular files only, so that a device or a pipe with such a name is never read.
  // Nothing when the directory cannot be listed.
  static std::optional<Sources> ListSources(const std::filesystem::path& directory);

  // Basic identifiers name the same unit in any letter case; extended ones ("\x\") do not.
  static std::string Key(const std::filesystem::path& directory, std::string unit);

  // The unit stored under `key` when it was read from exactly these sources, else null.
  RudIva_Node* Find(const std::string& key, const Sources& sources);
  // Keeps `node` under `key` (replacing any earlier entry) and answers it.
  RudIva_Node* Store(const std::string& key, Sources sources, std::unique_ptr<RudIva_Node> node);

 private:
  struct Entry {
    Sources sources;
    std::unique_ptr<RudIva_Node> node;
    std::uint64_t lastUse = 0;
  };

  void EvictLeastRecentlyUsed();

  std::map<std::string, Entry> entries_;
  std::uint64_t useCounter_ = 0;
};
