#include "vci/VerilogSourceFile.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>

namespace Hx_Vci {

namespace {

std::int64_t Nanoseconds(const timespec& time) {
  return static_cast<std::int64_t>(time.tv_sec) * 1000000000 + time.tv_nsec;
}

VerilogFileStamp StampOf(const struct stat& info) {
  VerilogFileStamp stamp;
  stamp.exists = true;
  stamp.size = static_cast<std::uint64_t>(info.st_size);
  stamp.modifiedNs = Nanoseconds(info.st_mtim);
  stamp.changedNs = Nanoseconds(info.st_ctim);
  stamp.inode = static_cast<std::uint64_t>(info.st_ino);
  stamp.device = static_cast<std::uint64_t>(info.st_dev);
  return stamp;
}

class ScopedDescriptor {
 public:
  explicit ScopedDescriptor(int fd) : fd_(fd) {}
  ScopedDescriptor(const ScopedDescriptor&) = delete;
  ScopedDescriptor& operator=(const ScopedDescriptor&) = delete;
  ~ScopedDescriptor() {
    if (fd_ >= 0) {
      ::close(fd_);
    }
  }
  int get() const { return fd_; }

 private:
  int fd_;
};

bool ReadAll(int fd, std::uint64_t expected, std::string* text) {
  text->resize(static_cast<std::size_t>(expected));
  std::size_t done = 0;
  while (done < text->size()) {
    ssize_t got = ::read(fd, text->data() + done, text->size() - done);
    if (got < 0 && errno == EINTR) {
      continue;
    }
    if (got < 0) {
      return false;
    }
    if (got == 0) {
      break;  // the file shrank meanwhile; take what is there
    }
    done += static_cast<std::size_t>(got);
  }
  text->resize(done);
  return true;
}

}  // namespace

VerilogSourceFile::ReadStatus VerilogSourceFile::Read(const std::string& path, std::string* text,
                                                      VerilogFileStamp* stamp) {
  text->clear();
  *stamp = VerilogFileStamp();
  // Non-blocking, so that a named pipe given as a source cannot hang the open; reads of a regular
  // file are not affected.
  ScopedDescriptor fd(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK));
  if (fd.get() < 0) {
    return ReadStatus::kCannotOpen;
  }
  struct stat info;
  if (::fstat(fd.get(), &info) != 0) {
    return ReadStatus::kCannotOpen;
  }
  *stamp = StampOf(info);
  if (!S_ISREG(info.st_mode)) {
    return ReadStatus::kCannotOpen;
  }
  if (static_cast<std::uint64_t>(info.st_size) > kMaxSize) {
    return ReadStatus::kTooLarge;
  }
  return ReadAll(fd.get(), static_cast<std::uint64_t>(info.st_size), text) ? ReadStatus::kOk
                                                                           : ReadStatus::kCannotOpen;
}

VerilogFileStamp VerilogSourceFile::Stat(const std::string& path, bool* isLink) {
  struct stat info;
  if (isLink != nullptr) {
    *isLink = false;
    if (::lstat(path.c_str(), &info) != 0) {
      return VerilogFileStamp();
    }
    *isLink = S_ISLNK(info.st_mode);
    if (!*isLink) {
      return StampOf(info);
    }
  }
  return ::stat(path.c_str(), &info) == 0 ? StampOf(info) : VerilogFileStamp();
}

}  // namespace Hx_Vci
