#include "InputStamp.h"

#include <time.h>

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
  if (::stat(path.c_str(), &facts) != 0 || !S_ISREG(facts.st_mode)) return std::nullopt;
  InputStamp stamp;
  stamp.path = path;
  stamp.size = static_cast<std::uint64_t>(facts.st_size);
  stamp.device = static_cast<std::uint64_t>(facts.st_dev);
  stamp.inode = static_cast<std::uint64_t>(facts.st_ino);
  stamp.modified = Nanoseconds(facts.st_mtim);
  stamp.changed = Nanoseconds(facts.st_ctim);
  std::int64_t latest = std::max(stamp.modified, stamp.changed);
  if (latest >= runStart - kTickNanoseconds) return std::nullopt;
  stamp.racy = latest >= runStart - kRacyNanoseconds;
  if (stamp.racy) {
    std::string text;
    if (!CacheFiles::Read(path, text) || text.size() != stamp.size) return std::nullopt;
    stamp.hash = CacheEntry::Hash(text);
  }
  return stamp;
}

bool InputStamp::SameStat(const struct stat& now) const {
  return S_ISREG(now.st_mode) && static_cast<std::uint64_t>(now.st_size) == size &&
         static_cast<std::uint64_t>(now.st_dev) == device &&
         static_cast<std::uint64_t>(now.st_ino) == inode && Nanoseconds(now.st_mtim) == modified &&
         Nanoseconds(now.st_ctim) == changed;
}

bool InputStamp::SameContent() const {
  std::string text;
  return CacheFiles::Read(path, text) && text.size() == size && CacheEntry::Hash(text) == hash;
}

bool InputStamp::Holds(const struct stat& now) const { return SameStat(now) && (!racy || SameContent()); }

bool InputStamp::Holds() const {
  struct stat now {};
  return ::stat(path.c_str(), &now) == 0 && Holds(now);
}

void InputStamp::Encode(Port::ArchiveEncoder& out) const {
  CacheEntry::PutText(out, path);
  for (std::uint64_t value : {size, device, inode, static_cast<std::uint64_t>(modified),
                              static_cast<std::uint64_t>(changed), std::uint64_t{racy}, hash})
    out.PutUInt64(value);
}

bool InputStamp::Decode(Port::ArchiveDecoder& in) {
  std::uint64_t values[7] = {};
  if (!CacheEntry::TakeText(in, path)) return false;
  for (std::uint64_t& value : values)
    if (!in.TakeUInt64(&value)) return false;
  size = values[0];
  device = values[1];
  inode = values[2];
  modified = static_cast<std::int64_t>(values[3]);
  changed = static_cast<std::int64_t>(values[4]);
  racy = values[5] != 0;
  hash = values[6];
  return values[5] <= 1;
}

}  // namespace quillon
