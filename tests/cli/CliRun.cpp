#include "CliRun.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <sstream>

extern char** environ;

namespace cli_test {

namespace {

std::vector<std::string> EnvironmentWith(const std::vector<std::pair<std::string, std::string>>& added) {
  std::vector<std::string> entries;
  for (char** entry = environ; *entry; ++entry) {
    std::string text = *entry;
    bool replaced = false;
    for (const auto& [name, value] : added) replaced = replaced || text.rfind(name + "=", 0) == 0;
    if (!replaced) entries.push_back(text);
  }
  for (const auto& [name, value] : added) entries.push_back(name + "=" + value);
  return entries;
}

std::vector<char*> PointersTo(std::vector<std::string>& texts) {
  std::vector<char*> pointers;
  for (std::string& text : texts) pointers.push_back(text.data());
  pointers.push_back(nullptr);
  return pointers;
}

// The terminal side of a pseudo-terminal whose other side `master` holds; -1 when none opens.
int OpenTerminal(int& master) {
  master = posix_openpt(O_RDWR | O_NOCTTY);
  if (master < 0 || grantpt(master) != 0 || unlockpt(master) != 0) return -1;
  const char* name = ptsname(master);
  return name ? open(name, O_RDWR | O_NOCTTY) : -1;
}

// What a child wrote to the terminal, read once it has ended: enough for the few lines of a test, as
// the terminal holds some kilobytes. The read fails once the buffer is drained.
std::string ReadTerminal(int master) {
  std::string text;
  char buffer[4096];
  for (ssize_t got; (got = read(master, buffer, sizeof buffer)) > 0;)
    text.append(buffer, static_cast<std::size_t>(got));
  return text;
}

}  // namespace

CliResult RunQuillon(const CliRun& run) { return RunProgram(QUILLON_CLI_PATH, run); }

CliResult RunProgram(const std::string& program, const CliRun& run) {
  ScopedTempDir capture;
  std::string outPath = capture.Path("stdout"), errPath = capture.Path("stderr");
  std::vector<std::string> argv{program};
  argv.insert(argv.end(), run.args.begin(), run.args.end());
  std::vector<std::string> environment = EnvironmentWith(run.environment);
  std::vector<char*> argPointers = PointersTo(argv), envPointers = PointersTo(environment);

  posix_spawn_file_actions_t actions;
  posix_spawn_file_actions_init(&actions);
  posix_spawn_file_actions_addopen(&actions, STDIN_FILENO,
                                   run.inputPath.empty() ? "/dev/null" : run.inputPath.c_str(), O_RDONLY, 0);
  posix_spawn_file_actions_addopen(&actions, STDOUT_FILENO, outPath.c_str(), O_WRONLY | O_CREAT | O_TRUNC,
                                   0600);
  int master = -1, terminal = run.errorToTerminal ? OpenTerminal(master) : -1;
  if (terminal >= 0) {
    posix_spawn_file_actions_adddup2(&actions, terminal, STDERR_FILENO);
  } else {
    posix_spawn_file_actions_addopen(&actions, STDERR_FILENO, errPath.c_str(), O_WRONLY | O_CREAT | O_TRUNC,
                                     0600);
  }
  if (!run.workDir.empty()) posix_spawn_file_actions_addchdir_np(&actions, run.workDir.c_str());
  pid_t child = 0;
  int spawned =
      posix_spawn(&child, argv[0].c_str(), &actions, nullptr, argPointers.data(), envPointers.data());
  posix_spawn_file_actions_destroy(&actions);
  if (terminal >= 0) close(terminal);

  CliResult result;
  if (spawned != 0) {
    result.err = std::string("cannot start ") + argv[0] + ": " + std::strerror(spawned);
    if (master >= 0) close(master);
    return result;
  }
  int waitStatus = 0;
  while (waitpid(child, &waitStatus, 0) < 0 && errno == EINTR) {
  }
  result.status = WIFEXITED(waitStatus) ? WEXITSTATUS(waitStatus) : 128 + WTERMSIG(waitStatus);
  result.out = ReadText(outPath);
  result.err = terminal >= 0 ? ReadTerminal(master) : ReadText(errPath);
  if (master >= 0) close(master);
  return result;
}

ScopedTextFile::ScopedTextFile(std::string_view text, std::string_view name) : path_(dir_.Path(name)) {
  std::ofstream(path_, std::ios::binary) << text;
}

std::string DataDir() { return std::string(QUILLON_TEST_DATA_DIR) + "/cli"; }
std::string DataPath(const std::string& name) { return DataDir() + "/" + name; }
std::string ExamplePath(const std::string& name) {
  static const std::string examples = std::filesystem::weakly_canonical(
      std::filesystem::path(QUILLON_TEST_DATA_DIR) / ".." / ".." / "examples");
  return examples + "/" + name;
}

std::string ReadText(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  return std::string(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
}

namespace {

void ReplaceAll(std::string& text, const std::string& what, const std::string& with) {
  if (what.empty()) return;
  for (std::size_t at = text.find(what); at != std::string::npos; at = text.find(what, at + with.size()))
    text.replace(at, what.size(), with);
}

}  // namespace

void ExpectOutputMatches(const std::string& text, const std::string& name, const std::string& tempDir) {
  std::string stable = text;
  ReplaceAll(stable, tempDir, "@TMP@");
  ReplaceAll(stable, DataDir(), "@DATA@");
  ReplaceAll(stable, ExamplePath(""), "@EXAMPLES@/");
  const std::string path = DataPath("expected/" + name);
  const char* update = std::getenv("QUILLON_UPDATE_EXPECTED");
  if (update && std::string(update) == "1") {
    std::ofstream(path, std::ios::binary) << stable;
    std::printf("rewrote %s\n", path.c_str());
    return;
  }
  EXPECT_TRUE(std::filesystem::is_regular_file(path)) << path;
  EXPECT_EQ(stable, ReadText(path)) << "differs from " << path;
}

void ExpectOutputsMatch(const std::vector<OutputCase>& cases) {
  for (const OutputCase& each : cases) {
    SCOPED_TRACE(each.expected);
    CliResult result = RunQuillon(CliRun{each.args, each.workDir, {}});
    EXPECT_EQ(result.status, each.status) << result.err;
    ExpectOutputMatches(result.out, each.expected);
  }
}

void ExpectRejected(const CliResult& result, const std::string& named) {
  EXPECT_EQ(result.status, 2) << result.err;
  EXPECT_EQ(result.out, "");
  std::vector<std::string> lines = Lines(result.err);
  ASSERT_EQ(lines.size(), 1u) << result.err;
  EXPECT_EQ(lines[0].rfind("quillon: ", 0), 0u) << lines[0];
  EXPECT_NE(lines[0].find(named), std::string::npos) << lines[0];
}

void ExpectAllRejected(const std::vector<BadInput>& cases) {
  for (const BadInput& bad : cases) {
    SCOPED_TRACE(bad.named);
    ExpectRejected(RunQuillon(CliRun{bad.args, bad.workDir, {}}), bad.named);
  }
}

std::vector<std::string> Lines(const std::string& text) {
  std::vector<std::string> lines;
  std::istringstream in(text);
  for (std::string line; std::getline(in, line);) lines.push_back(line);
  return lines;
}

}  // namespace cli_test
