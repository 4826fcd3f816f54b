#include "vci/VerilogFileWatch.h"

#include <sys/inotify.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <utility>

namespace Hx_Vci {

namespace {

constexpr std::uint32_t kEntryEvents =
    IN_MODIFY | IN_ATTRIB | IN_CLOSE_WRITE | IN_MOVED_FROM | IN_MOVED_TO | IN_CREATE | IN_DELETE;
constexpr std::uint32_t kDirectoryGone = IN_IGNORED | IN_DELETE_SELF | IN_MOVE_SELF | IN_UNMOUNT;

// The directory part and the entry name of `path`.
std::pair<std::string, std::string> SplitPath(const std::string& path) {
  const std::size_t slash = path.rfind('/');
  if (slash == std::string::npos) {
    return {std::string(1, '.'), path};
  }
  return {path.substr(0, slash == 0 ? 1 : slash), path.substr(slash + 1)};
}

}  // namespace

VerilogFileWatch::VerilogFileWatch() : descriptor_(inotify_init1(IN_NONBLOCK | IN_CLOEXEC)) {}

VerilogFileWatch::~VerilogFileWatch() {
  if (descriptor_ >= 0) {
    ::close(descriptor_);
  }
}

bool VerilogFileWatch::Watch(const std::string& path) {
  if (descriptor_ < 0) {
    return false;
  }
  if (watchOfPath_.count(path) != 0) {
    return true;
  }
  const auto [directory, name] = SplitPath(path);
  if (name.empty()) {
    return false;
  }
  int watch;
  auto known = watchOfDirectory_.find(directory);
  if (known != watchOfDirectory_.end()) {
    watch = known->second;
  } else {
    watch = inotify_add_watch(descriptor_, directory.c_str(), kEntryEvents | kDirectoryGone | IN_ONLYDIR);
    if (watch < 0) {
      return false;
    }
    watchOfDirectory_[directory] = watch;
    directories_[watch].path = directory;  // another spelling of a watched directory shares its watch
  }
  directories_[watch].entries[name].push_back(path);
  watchOfPath_[path] = watch;
  return true;
}

void VerilogFileWatch::Forget(const std::string& path) {
  auto found = watchOfPath_.find(path);
  if (found != watchOfPath_.end()) {
    Unwatch(path, found->second);
  }
}

void VerilogFileWatch::Unwatch(const std::string& path, int watch) {
  watchOfPath_.erase(path);
  auto directory = directories_.find(watch);
  if (directory == directories_.end()) {
    return;
  }
  auto entry = directory->second.entries.find(SplitPath(path).second);
  if (entry == directory->second.entries.end()) {
    return;
  }
  std::vector<std::string>& paths = entry->second;
  paths.erase(std::remove(paths.begin(), paths.end(), path), paths.end());
  if (paths.empty()) {
    directory->second.entries.erase(entry);
  }
}

VerilogFileWatch::Changes VerilogFileWatch::Collect() {
  Changes changes;
  if (descriptor_ < 0) {
    return changes;
  }
  alignas(inotify_event) char buffer[16 * 1024];
  while (true) {
    const ssize_t got = ::read(descriptor_, buffer, sizeof buffer);
    if (got < 0 && errno == EINTR) {
      continue;
    }
    if (got <= 0) {
      break;  // nothing more queued
    }
    std::size_t offset = 0;
    while (offset + sizeof(inotify_event) <= static_cast<std::size_t>(got)) {
      inotify_event event;
      std::memcpy(&event, buffer + offset, sizeof event);
      const char* name = buffer + offset + sizeof event;
      offset += sizeof event + event.len;
      if ((event.mask & IN_Q_OVERFLOW) != 0) {
        changes.all = true;
      } else if ((event.mask & kDirectoryGone) != 0) {
        DropDirectory(event.wd, &changes);
      } else if (event.len > 0) {
        ReportEntry(event.wd, std::string(name, strnlen(name, event.len)), &changes);
      }
    }
  }
  if (changes.all) {
    for (const auto& [path, watch] : watchOfPath_) changes.paths.push_back(path);
    watchOfPath_.clear();
    for (auto& [watch, directory] : directories_) directory.entries.clear();
  }
  return changes;
}

void VerilogFileWatch::ReportEntry(int watch, const std::string& name, Changes* changes) {
  auto directory = directories_.find(watch);
  if (directory == directories_.end()) {
    return;
  }
  auto entry = directory->second.entries.find(name);
  if (entry == directory->second.entries.end()) {
    return;
  }
  for (const std::string& path : entry->second) {
    changes->paths.push_back(path);
    watchOfPath_.erase(path);
  }
  directory->second.entries.erase(entry);
}

void VerilogFileWatch::DropDirectory(int watch, Changes* changes) {
  auto directory = directories_.find(watch);
  if (directory == directories_.end()) {
    return;
  }
  for (const auto& [name, paths] : directory->second.entries) {
    for (const std::string& path : paths) {
      changes->paths.push_back(path);
      watchOfPath_.erase(path);
    }
  }
  for (auto it = watchOfDirectory_.begin(); it != watchOfDirectory_.end();) {
    it = it->second == watch ? watchOfDirectory_.erase(it) : std::next(it);
  }
  directories_.erase(directory);
  inotify_rm_watch(descriptor_, watch);  // harmless when the kernel dropped it already
}

}  // namespace Hx_Vci
