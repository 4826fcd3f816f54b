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
// A file of the example project in examples/.
std::string ExamplePath(const std::string& name);
std::string ReadText(const std::string& path);

// Compares `text` with the file tests/data/cli/expected/NAME, in which @DATA@ stands for DataDir(),
// @EXAMPLES@ for the examples folder and @TMP@ for `tempDir` when one is given. With
// QUILLON_UPDATE_EXPECTED=1 in the environment the file is written from `text` instead.
void ExpectOutputMatches(const std::string& text, const std::string& name, const std::string& tempDir = {});

// One run whose standard output must match an expected file.
struct OutputCase {
  std::string expected;
  std::vector<std::string> args;
  int status = 0;
  std::string workDir = {};
};
void ExpectOutputsMatch(const std::vector<OutputCase>& cases);

// A usage or input mistake: exit status 2, nothing on standard output, and one line on standard error,
// "quillon: ..." naming `named`.
void ExpectRejected(const CliResult& result, const std::string& named);
struct BadInput {
  std::vector<std::string> args;
  std::string named;
  std::string workDir = {};
};
void ExpectAllRejected(const std::vector<BadInput>& cases);

// A file with the given text in a fresh temporary directory, removed at the end.
class ScopedTextFile {
 public:
  explicit ScopedTextFile(std::string_view text, std::string_view name = "list.f");
  const std::string& path() const { return path_; }
  const std::string& dir() const { return dir_.path(); }
  std::string Beside(std::string_view name) const { return dir_.Path(name); }

 private:
  ScopedTempDir dir_;
  std::string path_;
};

// The lines of a text, without their line ends.
std::vector<std::string> Lines(const std::string& text);

}  // namespace cli_test
