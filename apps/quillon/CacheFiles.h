// Reading and writing the files of a cache directory. Files are written under a temporary name
// and renamed, so that runs sharing the directory never see half a file; a cache that cannot be
// written costs time, not correctness, so failures only answer false.
#pragma once

#include <string>

namespace quillon {

class CacheFiles {
 public:
  // Makes `directory` when it is missing; writes `bytes` as `path` inside it.
  static bool Write(const std::string& directory, const std::string& path, const std::string& bytes);
  // The whole file; false when it cannot be read.
  static bool Read(const std::string& path, std::string& bytes);
};

}  // namespace quillon
