// quillon watch: prints the view again when a source changes, and ends cleanly on SIGINT.
#include <fcntl.h>
#include <gtest/gtest.h>
#include <signal.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <filesystem>
#include <fstream>
#include <nlohmann/json.hpp>
#include <set>
#include <string>
#include <thread>
#include <vector>

#include "CliRun.h"

extern char** environ;

namespace cli_test {
namespace {

namespace fs = std::filesystem;

std::string ReadText(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  return std::string((std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
}

// The lines the program wrote, once there are at least `count` (or after a generous wait, for a
// loaded machine and a sanitizer build).
std::vector<std::string> WaitForLines(const std::string& path, std::size_t count) {
  std::vector<std::string> lines;
  for (int tries = 0; tries < 1200 && (lines = Lines(ReadText(path))).size() < count; ++tries)
    std::this_thread::sleep_for(std::chrono::milliseconds(50));
  return lines;
}

// A running `quillon watch` whose standard output goes to a file.
class WatchRun {
 public:
  WatchRun(const std::string& output, std::vector<std::string> args) : output_(output) {
    args.insert(args.begin(), {QUILLON_CLI_PATH, "watch"});
    std::vector<char*> argv;
    for (std::string& arg : args) argv.push_back(arg.data());
    argv.push_back(nullptr);
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_addopen(&actions, STDOUT_FILENO, output.c_str(), O_WRONLY | O_CREAT | O_TRUNC,
                                     0600);
    if (posix_spawn(&child_, argv[0], &actions, nullptr, argv.data(), environ) != 0) child_ = 0;
    posix_spawn_file_actions_destroy(&actions);
  }
  ~WatchRun() {
    if (child_ > 0) Stop();
  }

  bool started() const { return child_ > 0; }
  std::vector<std::string> Lines(std::size_t count) const { return WaitForLines(output_, count); }
  // The exit status after SIGINT; -1 when it did not exit normally.
  int Stop() {
    int status = 0;
    if (kill(child_, SIGINT) != 0 || waitpid(child_, &status, 0) != child_) status = -1;
    child_ = 0;
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
  }

 private:
  std::string output_;
  pid_t child_ = 0;
};

TEST(Watch, PrintsTheNewAnswerAfterAnEditAndEndsWithStatusZeroOnSigint) {
  ScopedTempDir dir;
  const std::string source = dir.Path("top.vhd");
  std::ofstream(source) << "entity top is\nend top;\n";
  WatchRun watch(dir.Path("out.jsonl"), {"--show", "check", "--format", "json", source});
  ASSERT_TRUE(watch.started());

  std::vector<std::string> lines = watch.Lines(1);
  ASSERT_EQ(lines.size(), 1u);
  EXPECT_EQ(nlohmann::json::parse(lines[0])["units"], 1);

  std::ofstream(source, std::ios::app) << "entity second is\nend second;\n";
  lines = watch.Lines(2);
  ASSERT_EQ(lines.size(), 2u);
  EXPECT_EQ(nlohmann::json::parse(lines[1])["units"], 2);

  EXPECT_EQ(watch.Stop(), 0);
}

// An edit that instantiates a module of a -y directory brings that module's file in.
TEST(Watch, SearchesTheLibraryDirectoriesAgainAfterAnEdit) {
  ScopedTempDir dir;
  const std::string top = dir.Path("top.v");
  fs::create_directory(dir.Path("lib"));
  std::ofstream(dir.Path("lib/leaf.v")) << "module leaf;\nendmodule\n";
  std::ofstream(top) << "module top;\nendmodule\n";
  WatchRun watch(dir.Path("out.txt"), {"--show", "order", "-y", dir.Path("lib"), top});
  ASSERT_TRUE(watch.started());
  std::vector<std::string> lines = watch.Lines(1);
  ASSERT_EQ(lines.size(), 1u);
  EXPECT_EQ(lines[0].find("leaf.v"), std::string::npos) << lines[0];

  std::ofstream(top) << "module top;\n  leaf u();\nendmodule\n";
  lines = watch.Lines(3);
  ASSERT_EQ(lines.size(), 3u);
  std::set<std::string> answer{lines[1], lines[2]};
  EXPECT_EQ(answer, (std::set<std::string>{top, dir.Path("lib/leaf.v")}));
  EXPECT_EQ(watch.Stop(), 0);
}

}  // namespace
}  // namespace cli_test
