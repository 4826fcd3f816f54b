// Where quillon finds its module and its data: relative to the program itself, so that an
// installed tree can be moved, and the build tree works as it is.
#pragma once

#include <optional>
#include <string>

namespace quillon {

class InstallLayout {
 public:
  // The module QUILLON_MODULE names; else the one installed beside the program
  // (../lib/quillon/libquillon.so); else the one of the build tree. When none exists, the
  // installed path, so that the failure to load it names where it was looked for.
  static std::string ModulePath();
  // The installed data folder (../share/quillon/data) when it exists; the build tree's data is
  // known to the host library.
  static std::optional<std::string> InstalledDataDir();
  // The folder of the running program; empty when the system does not say.
  static std::string ProgramDir();
};

}  // namespace quillon
