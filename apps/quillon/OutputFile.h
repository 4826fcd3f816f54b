// The -o target of quillon: written as a temporary file beside the target and renamed into place
// only when the run succeeded, so a failing run leaves an existing output as it was.
#pragma once

#include <fstream>
#include <string>
#include <vector>

namespace quillon {

class OutputFile {
 public:
  OutputFile() = default;
  OutputFile(const OutputFile&) = delete;
  OutputFile& operator=(const OutputFile&) = delete;
  // Removes the temporary file unless it was committed.
  ~OutputFile();

  // True when `target` exists and is the same file as one of `inputs` (hard and symbolic links
  // included).
  static bool IsOneOf(const std::string& target, const std::vector<std::string>& inputs);

  // Creates the temporary file beside `target`; false, with a reason in `error`, when it cannot.
  bool Open(const std::string& target, std::string& error);
  std::ostream& stream() { return stream_; }
  // Flushes and renames the temporary file to the target; false, with a reason, when it fails.
  bool Commit(std::string& error);

 private:
  std::string target_;
  std::string temporary_;
  std::ofstream stream_;
};

}  // namespace quillon
