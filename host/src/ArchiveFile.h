// Whole-file input and replace-on-commit output for the project archive.
#pragma once

#include <string>
#include <string_view>

#include "Port/StringBase.h"

namespace Port {

// Reads the regular file at `path` into `bytes`. False, with the reason in `error`, otherwise.
bool ReadWholeFile(const char* path, std::string* bytes, StringBase* error);

// Replaces a file so that a reader sees either its old content or the whole new content, never a
// part: the bytes go to a new file beside the target, which is renamed over it once it is on disk.
// A writer destroyed before Commit removes its temporary file and leaves the target untouched.
class ReplacingFileWriter {
 public:
  ReplacingFileWriter() = default;
  ~ReplacingFileWriter() { Abandon(); }
  ReplacingFileWriter(const ReplacingFileWriter&) = delete;
  ReplacingFileWriter& operator=(const ReplacingFileWriter&) = delete;

  // Creates the temporary file beside `path` now, so that an unwritable place is reported at once.
  bool Begin(const char* path, StringBase* error);
  // Writes `bytes`, flushes them to disk and renames the temporary file over the target.
  bool Commit(std::string_view bytes, StringBase* error);
  // Removes the temporary file, if any.
  void Abandon();

 private:
  bool WriteAll(std::string_view bytes);

  std::string target_;
  std::string temporary_;
  int descriptor_ = -1;
};

}  // namespace Port
