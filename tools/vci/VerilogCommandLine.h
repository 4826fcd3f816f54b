// The argument vector of a compile: argv[0] names the command; then Verilog files in compile order
// and options: "+define+A=1+B" (macros NAME or NAME=VALUE), "+incdir+dir1+dir2", and any other
// "+..." option, which is accepted and ignored. Relative paths are made absolute.
#pragma once

#include <deque>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "vci/VerilogMessage.h"

namespace Hx_Vci {

class VerilogCommandLine {
 public:
  // Null and empty entries are skipped. The file paths may point into `argv`, which must outlive
  // the command line.
  VerilogCommandLine(int argc, const char* const* argv);
  VerilogCommandLine(const VerilogCommandLine&) = delete;
  VerilogCommandLine& operator=(const VerilogCommandLine&) = delete;

  const std::vector<std::string_view>& files() const { return files_; }
  // In order; a later definition of a name wins.
  const std::vector<std::pair<std::string, std::string>>& defines() const { return defines_; }
  const std::vector<std::string>& includeDirs() const { return includeDirs_; }
  // Problems with the arguments (bad macro names), to be reported with the compile.
  const std::vector<VerilogMessage>& messages() const { return messages_; }

  // The directory the process runs in, or "" when it cannot be told.
  static std::string CurrentDirectory();

 private:
  void AddDefines(const std::string& list);
  void AddIncludeDirs(const std::string& list);
  // Relative to the current directory, which is asked for once, when first needed.
  std::string Absolute(std::string path);

  bool workingDirectoryKnown_ = false;
  std::string workingDirectory_;
  // A long command line is mostly absolute paths, taken as they are without copying.
  std::vector<std::string_view> files_;
  std::deque<std::string> completedPaths_;
  std::vector<std::pair<std::string, std::string>> defines_;
  std::vector<std::string> includeDirs_;
  std::vector<VerilogMessage> messages_;
};

}  // namespace Hx_Vci
