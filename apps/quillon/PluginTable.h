// Which plug-in reads a source file, and the host file type that goes with each plug-in.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace quillon {

class PluginTable {
 public:
  static constexpr std::string_view kGeneralPlugin = "PLUGIN_General";

  // The plug-in of a path by its extension (letter case ignored); the general plug-in for any
  // other extension and for none.
  static std::string PluginForPath(std::string_view path);
  // The name of the host file type of a plug-in ("VHDL", "Verilog", ...) and its extensions; a
  // plug-in of no entry is its own file type name, with no extension.
  static std::string FileTypeName(std::string_view plugin);
  static std::vector<std::string_view> Extensions(std::string_view plugin);
};

}  // namespace quillon
