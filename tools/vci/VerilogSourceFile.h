// Reading a source file into memory, and the stamp of a file on disk.
#pragma once

#include <cstdint>
#include <string>

#include "vci/VerilogFileStamp.h"

namespace Hx_Vci {

class VerilogSourceFile {
 public:
  enum class ReadStatus { kOk, kCannotOpen, kTooLarge };
  static constexpr std::uint64_t kMaxSize = std::uint64_t{1} << 30;

  // Reads the whole file. `stamp` describes the file that was opened, taken from the open file
  // itself; a file that does not exist gets a stamp with exists false. Directories cannot be
  // read.
  static ReadStatus Read(const std::string& path, std::string* text, VerilogFileStamp* stamp);
  // The stamp of what is at `path` now (through symbolic links); `isLink` (optional) tells whether
  // `path` itself is a symbolic link.
  static VerilogFileStamp Stat(const std::string& path, bool* isLink = nullptr);
};

}  // namespace Hx_Vci
