// What identifies a version of a file on disk without reading it.
#pragma once

#include <cstdint>

namespace Hx_Vci {

struct VerilogFileStamp {
  bool exists = false;
  std::uint64_t size = 0;
  std::int64_t modifiedNs = 0;
  // The change time and the inode catch a replaced file whose size and modification time were kept.
  std::int64_t changedNs = 0;
  std::uint64_t inode = 0;
  std::uint64_t device = 0;

  bool operator==(const VerilogFileStamp&) const = default;
};

}  // namespace Hx_Vci
