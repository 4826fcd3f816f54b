#include "Port/File.h"

#include <dirent.h>
#include <fcntl.h>
#include <sys/random.h>
#include <sys/stat.h>
#include <unistd.h>

#include <atomic>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <string>
#include <string_view>
#include <vector>

#include "Port/StringBase.h"

namespace Port {

namespace {

constexpr std::string_view kTempPrefix = "quillon-";

bool IsKnownMode(std::string_view mode) {
  static constexpr std::string_view kModes[] = {"r",  "w",   "a",   "rb",  "wb",  "ab",  "r+", "w+",
                                                "a+", "rb+", "wb+", "ab+", "r+b", "w+b", "a+b"};
  for (std::string_view known : kModes) {
    if (mode == known) return true;
  }
  return false;
}

bool IsPath(const char* path) { return path && *path; }

bool StatPath(const char* path, struct stat* info) { return IsPath(path) && ::stat(path, info) == 0; }

std::string TempRoot() {
  const char* fromEnvironment = std::getenv("TMPDIR");
  std::string root = fromEnvironment && *fromEnvironment ? fromEnvironment : "";
  while (root.size() > 1 && root.back() == '/') root.pop_back();
  if (root.empty() || !File::isDirectory(root.c_str())) root = "/tmp";
  return root;
}

std::uint64_t RandomWord() {
  static std::atomic<std::uint64_t> fallbackCounter{0};
  std::uint64_t word = 0;
  if (::getrandom(&word, sizeof word, GRND_NONBLOCK) == static_cast<ssize_t>(sizeof word)) return word;
  timespec now{};
  ::clock_gettime(CLOCK_REALTIME, &now);
  return (static_cast<std::uint64_t>(now.tv_sec) << 30) ^ static_cast<std::uint64_t>(now.tv_nsec) ^
         (static_cast<std::uint64_t>(::getpid()) << 40) ^ (++fallbackCounter * 0x9E3779B97F4A7C15ull);
}

std::vector<std::string> EntryNames(DIR* dir) {
  std::vector<std::string> names;
  while (dirent* entry = ::readdir(dir)) {
    std::string_view name = entry->d_name;
    if (name != "." && name != "..") names.emplace_back(name);
  }
  return names;
}

bool RemoveDirectoryContents(int dirFd);

bool RemoveEntry(int parentFd, const char* name) {
  struct stat info;
  if (::fstatat(parentFd, name, &info, AT_SYMLINK_NOFOLLOW) != 0) return false;
  if (!S_ISDIR(info.st_mode)) return ::unlinkat(parentFd, name, 0) == 0;
  // O_NOFOLLOW: a directory swapped for a link after the check is refused, not followed.
  int childFd = ::openat(parentFd, name, O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC);
  bool emptied = childFd >= 0 && RemoveDirectoryContents(childFd);
  return ::unlinkat(parentFd, name, AT_REMOVEDIR) == 0 && emptied;
}

// Takes ownership of `dirFd`.
bool RemoveDirectoryContents(int dirFd) {
  DIR* dir = ::fdopendir(dirFd);
  if (!dir) {
    ::close(dirFd);
    return false;
  }
  bool removedAll = true;
  // Names are gathered first: removing entries while reading the directory may skip some.
  for (const std::string& name : EntryNames(dir)) {
    removedAll = RemoveEntry(::dirfd(dir), name.c_str()) && removedAll;
  }
  ::closedir(dir);
  return removedAll;
}

}  // namespace

std::unique_ptr<Stream> File::open(const char* path, const char* mode) {
  if (!IsPath(path) || !mode || !IsKnownMode(mode)) return nullptr;
  // "e": descriptors of our files must not leak into child processes.
  std::string modeCloseOnExec = std::string(mode) + "e";
  std::FILE* file = std::fopen(path, modeCloseOnExec.c_str());
  if (!file) return nullptr;
  std::unique_ptr<Stream> stream(new Stream(file));
  struct stat info;
  if (::fstat(::fileno(file), &info) != 0 || S_ISDIR(info.st_mode)) return nullptr;
  return stream;
}

void File::close(std::unique_ptr<Stream>& stream) { stream.reset(); }

bool File::exist(const char* path) { return IsPath(path) && ::access(path, F_OK) == 0; }

bool File::isDirectory(const char* path) {
  struct stat info;
  return StatPath(path, &info) && S_ISDIR(info.st_mode);
}

bool File::remove_r(const char* path) {
  if (!IsPath(path)) return false;
  struct stat info;
  if (::lstat(path, &info) != 0) return false;
  if (!S_ISDIR(info.st_mode)) return ::unlink(path) == 0;
  int dirFd = ::open(path, O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC);
  bool emptied = dirFd >= 0 && RemoveDirectoryContents(dirFd);
  return ::rmdir(path) == 0 && emptied;
}

bool File::mkdir(const char* path) { return IsPath(path) && ::mkdir(path, 0777) == 0; }

bool File::chdir(const char* path) { return IsPath(path) && ::chdir(path) == 0; }

bool File::getcwd(StringBase* dir) {
  if (!dir) return false;
  std::string buffer(256, '\0');
  while (::getcwd(buffer.data(), buffer.size()) == nullptr) {
    if (errno != ERANGE || buffer.size() > (1u << 20)) return false;
    buffer.resize(buffer.size() * 2);
  }
  *dir = buffer.c_str();
  return true;
}

bool File::tmpnam(StringBase* name) {
  if (!name) return false;
  std::string root = TempRoot();
  for (int attempt = 0; attempt < 100; ++attempt) {
    char word[17];
    std::snprintf(word, sizeof word, "%016llx", static_cast<unsigned long long>(RandomWord()));
    std::string candidate = root + "/" + std::string(kTempPrefix) + std::to_string(::getpid()) + "-" + word;
    struct stat info;
    if (::lstat(candidate.c_str(), &info) != 0 && errno == ENOENT) {
      *name = candidate.c_str();
      return true;
    }
  }
  return false;
}

bool File::mkdtemp(StringBase* dir) {
  if (!dir) return false;
  std::string pattern = TempRoot() + "/" + std::string(kTempPrefix) + "XXXXXX";
  if (::mkdtemp(pattern.data()) == nullptr) return false;
  *dir = pattern.c_str();
  return true;
}

bool File::getdatetime(const char* path, std::int64_t* modificationSeconds) {
  struct stat info;
  if (!modificationSeconds || !StatPath(path, &info)) return false;
  *modificationSeconds = static_cast<std::int64_t>(info.st_mtim.tv_sec);
  return true;
}

bool File::getsize(const char* path, std::uint64_t* size) {
  struct stat info;
  if (!size || !StatPath(path, &info)) return false;
  *size = static_cast<std::uint64_t>(info.st_size);
  return true;
}

}  // namespace Port
