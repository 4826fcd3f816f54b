// What a run knew of one input file or directory: enough to tell later, by stat alone where that
// is safe, whether the file still holds what the run read (for a directory: the names in it). A file modified
// shortly before the run may be modified again within the same tick of the file system's clock without any
// stat field moving (the racy case); such a file keeps its content hash, and its content is compared on every
// check.
#pragma once

#include <sys/stat.h>

#include <cstdint>
#include <optional>
#include <string>

#include "Port/ArchiveCodec.h"

namespace quillon {

struct InputStamp {
  // Files modified this close to the start of a run are racy (covers file systems that keep
  // whole seconds, or two).
  static constexpr std::int64_t kRacyNanoseconds = 3'000'000'000;
  // Files modified this close to the start or later may have changed while the run read them.
  static constexpr std::int64_t kTickNanoseconds = 20'000'000;

  std::string path;
  std::uint64_t size = 0;
  std::uint64_t device = 0;
  std::uint64_t inode = 0;
  std::int64_t modified = 0;  // nanoseconds
  std::int64_t changed = 0;   // nanoseconds
  bool directory = false;
  bool racy = false;
  std::uint64_t hash = 0;  // of the content, when racy

  // The stamp of `path` for a run that started at `runStart` (nanoseconds of the real-time
  // clock). Nothing for what is neither a readable regular file nor a directory, and for one
  // modified since the run started: which content the run read is not known then.
  static std::optional<InputStamp> Take(const std::string& path, std::int64_t runStart);
  // Whether the file, whose stat today is `now`, still holds what was stamped.
  bool Holds(const struct stat& now) const;
  bool Holds() const;

  static std::int64_t Now();

  // The numbers of an encoded stamp, after its path.
  static constexpr std::size_t kNumbers = 8;
  void Encode(Port::ArchiveEncoder& out) const;
  bool Decode(Port::ArchiveDecoder& in);

 private:
  bool SameStat(const struct stat& now) const;
  bool SameContent() const;
  // The file's text or the directory's sorted names; nothing when it cannot be read.
  std::optional<std::string> Content() const;
};

}  // namespace quillon
