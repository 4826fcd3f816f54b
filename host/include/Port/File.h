// File services of the host: opening streams, existence, directories, temporary names, times.
// Every operation reports through its result; a null path is refused with false (or null).
#pragma once

#include <cstdint>
#include <memory>

#include "Port/Stream.h"

namespace Port {

class StringBase;

class File {
 public:
  // Opens `path` with mode "r", "w", "a", "rb", "wb", "ab" or one of these with "+". Null when
  // the mode is unknown or the file cannot be opened, and for a directory.
  static std::unique_ptr<Stream> open(const char* path, const char* mode);
  // Closes the stream (if any) and empties the pointer.
  static void close(std::unique_ptr<Stream>& stream);

  // True when something exists at `path` (a symbolic link counts when its target exists).
  static bool exist(const char* path);
  static bool isDirectory(const char* path);

  // Removes a file, a symbolic link (never its target) or a directory with everything below
  // it; links inside the tree are removed, not followed. False when `path` does not exist or
  // something could not be removed (as much as possible is removed all the same).
  static bool remove_r(const char* path);

  // Creates one directory (mode 0777 less the umask); false when it exists already.
  static bool mkdir(const char* path);
  static bool chdir(const char* path);
  static bool getcwd(StringBase* dir);

  // A fresh name, nothing existing under it now, in TMPDIR (when it names a directory) or /tmp.
  // Only a name: to get a directory use mkdtemp, which creates it without a race.
  static bool tmpnam(StringBase* name);
  // Creates a new directory with a unique name in the same place, mode 0700, and returns it.
  static bool mkdtemp(StringBase* dir);

  // Modification time in seconds since the epoch; true on success.
  static bool getdatetime(const char* path, std::int64_t* modificationSeconds);
  // Size in bytes; true on success.
  static bool getsize(const char* path, std::uint64_t* size);
};

}  // namespace Port
