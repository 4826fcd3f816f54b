#include "PluginTable.h"

#include <algorithm>
#include <array>
#include <cctype>

#include "Port/FileName.h"

namespace quillon {

namespace {

struct PluginEntry {
  std::string_view plugin;
  std::string_view fileType;
  std::vector<std::string_view> extensions;
};

const std::array<PluginEntry, 8>& Entries() {
  static const std::array<PluginEntry, 8> entries = {{
      {"PLUGIN_Vhdl", "VHDL", {"vhd", "vhdl", "vho"}},
      {"PLUGIN_Verilog", "Verilog", {"v", "vh", "vlg", "sv"}},
      {"PLUGIN_Edif", "EDIF", {"edf", "edif", "edn"}},
      {"PLUGIN_Hrf", "Hierarchy", {"hrf"}},
      {"PLUGIN_Abel", "ABEL", {"abl"}},
      {"PLUGIN_AbelVector", "ABEL vectors", {"abv"}},
      {"PLUGIN_Schematic", "Schematic", {"sch"}},
      {PluginTable::kGeneralPlugin, "General", {}},
  }};
  return entries;
}

std::string Lowered(std::string_view text) {
  std::string lowered(text);
  std::transform(lowered.begin(), lowered.end(), lowered.begin(),
                 [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
  return lowered;
}

const PluginEntry* EntryOfPlugin(std::string_view plugin) {
  for (const PluginEntry& entry : Entries()) {
    if (entry.plugin == plugin) return &entry;
  }
  return nullptr;
}

}  // namespace

std::string PluginTable::PluginForPath(std::string_view path) {
  std::string extension = Lowered(Port::FileName::GetExtension(path).view());
  for (const PluginEntry& entry : Entries()) {
    if (std::find(entry.extensions.begin(), entry.extensions.end(), extension) != entry.extensions.end()) {
      return std::string(entry.plugin);
    }
  }
  return std::string(kGeneralPlugin);
}

std::string PluginTable::FileTypeName(std::string_view plugin) {
  const PluginEntry* entry = EntryOfPlugin(plugin);
  return std::string(entry ? entry->fileType : plugin);
}

std::vector<std::string_view> PluginTable::Extensions(std::string_view plugin) {
  const PluginEntry* entry = EntryOfPlugin(plugin);
  return entry ? entry->extensions : std::vector<std::string_view>();
}

}  // namespace quillon
