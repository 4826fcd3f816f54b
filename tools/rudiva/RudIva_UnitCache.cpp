#include "rudiva/RudIva_UnitCache.h"

#include <algorithm>
#include <system_error>
#include <utility>

namespace fs = std::filesystem;

namespace {

char ToLower(char c) { return (c >= 'A' && c <= 'Z') ? static_cast<char>(c - 'A' + 'a') : c; }

bool HasSourceExtension(const fs::path& file) {
  std::string extension = file.extension().string();
  std::transform(extension.begin(), extension.end(), extension.begin(), ToLower);
  return extension == ".vhd" || extension == ".vhdl" || extension == ".vho";
}

}  // namespace

std::optional<RudIva_UnitCache::Sources> RudIva_UnitCache::ListSources(const fs::path& directory) {
  std::error_code error;
  fs::directory_iterator entries(directory, error);
  if (error) return std::nullopt;
  Sources sources;
  for (; entries != fs::directory_iterator(); entries.increment(error)) {
    if (error) return std::nullopt;
    const fs::directory_entry& entry = *entries;
    if (!HasSourceExtension(entry.path()) || !entry.is_regular_file(error)) continue;
    SourceFile source{entry.path().filename().string(), entry.file_size(error), entry.last_write_time(error)};
    if (!error) sources.push_back(std::move(source));
  }
  std::sort(sources.begin(), sources.end(), [](const auto& a, const auto& b) { return a.name < b.name; });
  return sources;
}

std::string RudIva_UnitCache::Key(const fs::path& directory, std::string unit) {
  if (unit.empty() || unit.front() != '\\') std::transform(unit.begin(), unit.end(), unit.begin(), ToLower);
  return directory.string() + '\n' + unit;
}

RudIva_Node* RudIva_UnitCache::Find(const std::string& key, const Sources& sources) {
  auto found = entries_.find(key);
  if (found == entries_.end() || found->second.sources != sources) return nullptr;
  found->second.lastUse = ++useCounter_;
  return found->second.node.get();
}

RudIva_Node* RudIva_UnitCache::Store(const std::string& key, Sources sources,
                                     std::unique_ptr<RudIva_Node> node) {
  entries_.erase(key);
  if (entries_.size() >= kMaxUnits) EvictLeastRecentlyUsed();
  Entry& entry = entries_[key];
  entry.sources = std::move(sources);
  entry.node = std::move(node);
  entry.lastUse = ++useCounter_;
  return entry.node.get();
}

void RudIva_UnitCache::EvictLeastRecentlyUsed() {
  auto oldest = std::min_element(entries_.begin(), entries_.end(), [](const auto& a, const auto& b) {
    return a.second.lastUse < b.second.lastUse;
  });
  if (oldest != entries_.end()) entries_.erase(oldest);
}
