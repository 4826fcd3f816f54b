// quillon watch: prints the view again when a source changes, and ends cleanly on SIGINT.
#include <fcntl.h>
#include <gtest/gtest.h>
#include <signal.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <fstream>
#include <nlohmann/json.hpp>
#include <string>
#include <thread>
#include <vector>

#include "CliRun.h"

extern char** environ;

namespace cli_test {
namespace {

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

TEST(Watch, PrintsTheNewAnswerAfterAnEditAndEndsWithStatusZeroOnSigint) {
  ScopedTempDir dir;
  const std::string source = dir.Path("top.vhd"), output = dir.Path("out.jsonl");
  std::ofstream(source) << "entity top is\nend top;\n";

  std::vector<std::string> args{QUILLON_CLI_PATH, "watch", "--show", "check", "--format", "json", source};
  std::vector<char*> argv;
  for (std::string& arg : args) argv.push_back(arg.data());
  argv.push_back(nullptr);
  posix_spawn_file_actions_t actions;
  posix_spawn_file_actions_init(&actions);
  posix_spawn_file_actions_addopen(&actions, STDOUT_FILENO, output.c_str(), O_WRONLY | O_CREAT | O_TRUNC,
                                   0600);
  pid_t child = 0;
  ASSERT_EQ(posix_spawn(&child, argv[0], &actions, nullptr, argv.data(), environ), 0);
  posix_spawn_file_actions_destroy(&actions);

  std::vector<std::string> lines = WaitForLines(output, 1);
  ASSERT_EQ(lines.size(), 1u);
  EXPECT_EQ(nlohmann::json::parse(lines[0])["units"], 1);

  std::ofstream(source, std::ios::app) << "entity second is\nend second;\n";
  lines = WaitForLines(output, 2);
  ASSERT_EQ(lines.size(), 2u);
  EXPECT_EQ(nlohmann::json::parse(lines[1])["units"], 2);

  ASSERT_EQ(kill(child, SIGINT), 0);
  int status = 0;
  ASSERT_EQ(waitpid(child, &status, 0), child);
  ASSERT_TRUE(WIFEXITED(status)) << "signal " << WTERMSIG(status);
  EXPECT_EQ(WEXITSTATUS(status), 0);
}

}  // namespace
}  // namespace cli_test
