#include "OutputFile.h"

#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>

namespace quillon {

namespace {

bool SameFile(const struct stat& a, const struct stat& b) {
  return a.st_dev == b.st_dev && a.st_ino == b.st_ino;
}

std::string Reason() { return std::strerror(errno); }

}  // namespace

OutputFile::~OutputFile() {
  if (temporary_.empty()) return;
  stream_.close();
  std::remove(temporary_.c_str());
}

bool OutputFile::IsOneOf(const std::string& target, const std::vector<std::string>& inputs) {
  struct stat output;
  if (::stat(target.c_str(), &output) != 0) return false;
  for (const std::string& input : inputs) {
    struct stat other;
    if (::stat(input.c_str(), &other) == 0 && SameFile(output, other)) return true;
  }
  return false;
}

bool OutputFile::Open(const std::string& target, std::string& error) {
  std::string pattern = target + ".XXXXXX";
  int fd = ::mkstemp(pattern.data());
  if (fd < 0) {
    error = "cannot write the output file " + target + ": " + Reason();
    return false;
  }
  ::close(fd);
  target_ = target;
  temporary_ = pattern;
  stream_.open(temporary_, std::ios::binary | std::ios::trunc);
  if (!stream_) {
    error = "cannot write the output file " + target;
    return false;
  }
  return true;
}

bool OutputFile::Commit(std::string& error) {
  stream_.flush();
  bool written = static_cast<bool>(stream_);
  stream_.close();
  if (!written || stream_.fail()) {
    error = "the output could not be written to " + target_;
    return false;
  }
  // mkstemp creates the file readable by its owner only; give it the mode a new file would get.
  mode_t mask = ::umask(0);
  ::umask(mask);
  ::chmod(temporary_.c_str(), 0666 & ~mask);
  if (std::rename(temporary_.c_str(), target_.c_str()) != 0) {
    error = "cannot replace the output file " + target_ + ": " + Reason();
    return false;
  }
  temporary_.clear();
  return true;
}

}  // namespace quillon
