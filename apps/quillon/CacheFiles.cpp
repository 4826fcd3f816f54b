#include "CacheFiles.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <fstream>
#include <iterator>

namespace quillon {

bool CacheFiles::Write(const std::string& directory, const std::string& path, const std::string& bytes) {
  if (::mkdir(directory.c_str(), 0777) != 0 && errno != EEXIST) return false;
  std::string temporary = path + ".XXXXXX";
  int descriptor = ::mkstemp(temporary.data());
  if (descriptor < 0) return false;
  std::size_t written = 0;
  while (written < bytes.size()) {
    ssize_t count = ::write(descriptor, bytes.data() + written, bytes.size() - written);
    if (count < 0 && errno == EINTR) continue;
    if (count <= 0) break;
    written += static_cast<std::size_t>(count);
  }
  bool complete = ::close(descriptor) == 0 && written == bytes.size();
  if (complete && ::rename(temporary.c_str(), path.c_str()) == 0) return true;
  ::unlink(temporary.c_str());
  return false;
}

bool CacheFiles::Read(const std::string& path, std::string& bytes) {
  std::ifstream in(path, std::ios::binary);
  if (!in) return false;
  bytes.assign(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
  return !in.bad();
}

}  // namespace quillon
