#include "ArchiveFile.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <atomic>
#include <cerrno>
#include <cstring>

namespace Port {
namespace {

constexpr int kTemporaryNameAttempts = 100;

void SetError(StringBase* error, const char* what, const std::string& path, int errorNumber) {
  if (error) error->Format("%s '%s': %s", what, path.c_str(), std::strerror(errorNumber));
}

std::string TemporaryNameBeside(const std::string& target) {
  static std::atomic<unsigned> sequence{0};
  return target + ".tmp" + std::to_string(::getpid()) + "-" + std::to_string(sequence.fetch_add(1));
}

std::string DirectoryOf(const std::string& path) {
  std::size_t slash = path.rfind('/');
  if (slash == std::string::npos) return ".";
  return slash == 0 ? "/" : path.substr(0, slash);
}

// The rename is durable only once the directory entry itself is on disk.
void SyncDirectoryOf(const std::string& path) {
  int directory = ::open(DirectoryOf(path).c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
  if (directory < 0) return;
  ::fsync(directory);
  ::close(directory);
}

bool ReadAll(int descriptor, std::string* bytes) {
  char chunk[65536];
  for (;;) {
    ssize_t count = ::read(descriptor, chunk, sizeof chunk);
    if (count == 0) return true;
    if (count < 0) {
      if (errno == EINTR) continue;
      return false;
    }
    bytes->append(chunk, static_cast<std::size_t>(count));
  }
}

}  // namespace

bool ReadWholeFile(const char* path, std::string* bytes, StringBase* error) {
  bytes->clear();
  if (!path || !*path) {
    if (error) *error = "no archive path given";
    return false;
  }
  int descriptor = ::open(path, O_RDONLY | O_NONBLOCK | O_CLOEXEC);  // a FIFO must not block the open
  if (descriptor < 0) {
    SetError(error, "cannot open", path, errno);
    return false;
  }
  struct stat info {};
  bool ok = ::fstat(descriptor, &info) == 0;
  int failure = ok ? 0 : errno;
  if (ok && !S_ISREG(info.st_mode)) {
    ok = false;
    failure = EISDIR;
  }
  if (ok && !ReadAll(descriptor, bytes)) {
    ok = false;
    failure = errno;
  }
  ::close(descriptor);
  if (!ok) SetError(error, "cannot read", path, failure);
  return ok;
}

bool ReplacingFileWriter::Begin(const char* path, StringBase* error) {
  Abandon();
  if (!path || !*path) {
    if (error) *error = "no archive path given";
    return false;
  }
  target_ = path;
  for (int attempt = 0; attempt < kTemporaryNameAttempts; ++attempt) {
    temporary_ = TemporaryNameBeside(target_);
    descriptor_ = ::open(temporary_.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0666);
    if (descriptor_ >= 0) return true;
    if (errno != EEXIST) break;
  }
  SetError(error, "cannot create a file beside", target_, errno);
  temporary_.clear();
  return false;
}

bool ReplacingFileWriter::Commit(std::string_view bytes, StringBase* error) {
  if (descriptor_ < 0) {
    if (error) *error = "the archive file was not created";
    return false;
  }
  int failure = 0;
  if (!WriteAll(bytes) || ::fsync(descriptor_) != 0) failure = errno;
  if (::close(descriptor_) != 0 && failure == 0) failure = errno;
  descriptor_ = -1;
  if (failure != 0) {
    SetError(error, "cannot write", temporary_, failure);
    Abandon();
    return false;
  }
  if (::rename(temporary_.c_str(), target_.c_str()) != 0) {
    SetError(error, "cannot replace", target_, errno);
    Abandon();
    return false;
  }
  temporary_.clear();
  SyncDirectoryOf(target_);
  return true;
}

void ReplacingFileWriter::Abandon() {
  if (descriptor_ >= 0) ::close(descriptor_);
  descriptor_ = -1;
  if (!temporary_.empty()) ::unlink(temporary_.c_str());
  temporary_.clear();
}

bool ReplacingFileWriter::WriteAll(std::string_view bytes) {
  while (!bytes.empty()) {
    ssize_t count = ::write(descriptor_, bytes.data(), bytes.size());
    if (count < 0) {
      if (errno == EINTR) continue;
      return false;
    }
    bytes.remove_prefix(static_cast<std::size_t>(count));
  }
  return true;
}

}  // namespace Port
