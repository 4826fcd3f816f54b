// Runs the built quillon program as a user does and captures what it writes.
#pragma once

#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "ScopedTempDir.h"

namespace cli_test {

struct CliResult {
  int status = -1;  // exit status; 128 + the signal when a signal ended it; -1 when not started
  std::string out;
  std::string err;
};

struct CliRun {
  std::vector<std::string> args;
  std::string workDir;                                           // empty: the test's own
  std::vector<std::pair<std::string, std::string>> environment;  // added to the test's own
  std::string inputPath = {};                                    // standard input; empty: none
  bool errorToTerminal = false;  // standard error on a pseudo-terminal instead of a file
};

// Standard output and standard error go to files (or standard error to a terminal) of a temporary directory,
// so that neither can fill a pipe and block the child.
CliResult RunQuillon(const CliRun& run);
// The same for another program.
CliResult RunProgram(const std::string& program, const CliRun& run);
inline CliResult RunQuillon(std::vector<std::string> args) {
  return RunQuillon(CliRun{std::move(args), {}, {}});
}

// The test data folder of these tests: tests/data/cli.
std::string DataDir();
std::string DataPath(const std::string& name);

// A file with the given text in a fresh temporary directory, removed at the end.
class ScopedTextFile {
 public:
  explicit ScopedTextFile(std::string_view text, std::string_view name = "list.f");
  const std::string& path() const { return path_; }
  std::string Beside(std::string_view name) const { return dir_.Path(name); }

 private:
  ScopedTempDir dir_;
  std::string path_;
};

// The lines of a text, without their line ends.
std::vector<std::string> Lines(const std::string& text);

}  // namespace cli_test
