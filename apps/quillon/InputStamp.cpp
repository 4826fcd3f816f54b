#include "InputStamp.h"

#include <dirent.h>
#include <time.h>

#include <algorithm>
#include <vector>

#include "CacheEntry.h"
#include "CacheFiles.h"

namespace quillon {

namespace {

std::int64_t Nanoseconds(const timespec& time) {
  return static_cast<std::int64_t>(time.tv_sec) * 1'000'000'000 + time.tv_nsec;
}

}  // namespace

std::int64_t InputStamp::Now() {
  timespec now{};
  ::clock_gettime(CLOCK_REALTIME, &now);
  return Nanoseconds(now);
}

std::optional<InputStamp> InputStamp::Take(const std::string& path, std::int64_t runStart) {
  struct stat facts {};
  if (::stat(path.c_str(), &facts) != 0 || !(S_ISREG(facts.st_mode) || S_ISDIR(facts.st_mode)))
    return std::nullopt;
  InputStamp stamp;
  stamp.path = path;
  stamp.directory = S_ISDIR(facts.st_mode);
  stamp.size = static_cast<std::uint64_t>(facts.st_size);
  stamp.device = static_cast<std::uint64_t>(facts.st_dev);
  stamp.inode = static_cast<std::uint64_t>(facts.st_ino);
  stamp.modified = Nanoseconds(facts.st_mtim);
  stamp.changed = Nanoseconds(facts.st_ctim);
  std::int64_t latest = std::max(stamp.modified, stamp.changed);
  if (latest >= runStart - kTickNanoseconds) return std::nullopt;
  stamp.racy = latest >= runStart - kRacyNanoseconds;
  if (stamp.racy) {
    std::optional<std::string> content = stamp.Content();
    if (!content) return std::nullopt;
    stamp.hash = CacheEntry::Hash(*content);
  }
  return stamp;
}

std::optional<std::string> InputStamp::Content() const {
  if (!directory) {
    std::string text;
    if (!CacheFiles::Read(path, text) || text.size() != size) return std::nullopt;
    return text;
  }
  DIR* listing = ::opendir(path.c_str());
  if (!listing) return std::nullopt;
  std::vector<std::string> names;
  while (const dirent* entry = ::readdir(listing)) names.emplace_back(entry->d_name);
  ::closedir(listing);
  std::sort(names.begin(), names.end());
  std::string text;
  for (const std::string& name : names) text.append(name).append(1, '\0');
  return text;
}

bool InputStamp::SameStat(const struct stat& now) const {
  return (directory ? S_ISDIR(now.st_mode) : S_ISREG(now.st_mode)) &&
         static_cast<std::uint64_t>(now.st_size) == size &&
         static_cast<std::uint64_t>(now.st_dev) == device &&
         static_cast<std::uint64_t>(now.st_ino) == inode && Nanoseconds(now.st_mtim) == modified &&
         Nanoseconds(now.st_ctim) == changed;
}

bool InputStamp::SameContent() const {
  std::optional<std::string> content = Content();
  return content && CacheEntry::Hash(*content) == hash;
}

bool InputStamp::Holds(const struct stat& now) const { return SameStat(now) && (!racy || SameContent()); }

bool InputStamp::Holds() const {
  struct stat now {};
  return ::stat(path.c_str(), &now) == 0 && Holds(now);
}

void InputStamp::Encode(Port::ArchiveEncoder& out) const {
  CacheEntry::PutText(out, path);
  for (std::uint64_t value :
       {size, device, inode, static_cast<std::uint64_t>(modified), static_cast<std::uint64_t>(changed),
        std::uint64_t{directory}, std::uint64_t{racy}, hash})
    out.PutUInt64(value);
}

bool InputStamp::Decode(Port::ArchiveDecoder& in) {
  std::uint64_t values[kNumbers] = {};
  if (!CacheEntry::TakeText(in, path)) return false;
  for (std::uint64_t& value : values)
    if (!in.TakeUInt64(&value)) return false;
  size = values[0];
  device = values[1];
  inode = values[2];
  modified = static_cast<std::int64_t>(values[3]);
  changed = static_cast<std::int64_t>(values[4]);
  directory = values[5] != 0;
  racy = values[6] != 0;
  hash = values[7];
  return values[5] <= 1 && values[6] <= 1;
}

}  // namespace quillon
