// An installed quillon finds its module and data relative to itself, so the tree can be moved.
#include <gtest/gtest.h>

#include <filesystem>
#include <set>
#include <string>

#include "CliRun.h"
#include "ScopedTempDir.h"

namespace cli_test {
namespace {

namespace fs = std::filesystem;

std::set<std::string> FileNamesUnder(const std::string& dir) {
  std::set<std::string> names;
  for (const fs::directory_entry& entry : fs::recursive_directory_iterator(dir))
    if (entry.is_regular_file()) names.insert(entry.path().filename().string());
  return names;
}

TEST(InstallLayout, InstalledTreeStillWorksAfterItIsMoved) {
  ScopedTempDir root;
  const std::string prefix = root.Path("first"), moved = root.Path("moved");
  CliRun install{{"--install", QUILLON_BUILD_DIR, "--prefix", prefix}, {}, {}};
  CliResult installed = RunProgram(QUILLON_CMAKE_COMMAND, install);
  ASSERT_EQ(installed.status, 0) << installed.out << installed.err;
  std::set<std::string> names = FileNamesUnder(prefix);
  for (const char* name : {"quillon", "libquillon.so", "quillon.1", "_quillon", "vcomponents.vhd"})
    EXPECT_TRUE(names.count(name)) << name;

  fs::rename(prefix, moved);
  const std::vector<std::string> order{"order", "--with-library", "-P", DataPath("mixed/project.json")};
  CliRun fromMoved{order, {}, {{"QUILLON_MODULE", ""}, {"CORVANE", ""}, {"QUILLON_DATA_DIR", ""}}};
  const std::string movedProgram = moved + "/bin/quillon";
  CliResult result = RunProgram(movedProgram, fromMoved);
  EXPECT_EQ(result.status, 0) << result.err;
  EXPECT_EQ(result.out, RunQuillon(order).out);

  fromMoved.args = {"--version"};
  std::vector<std::string> version = Lines(RunProgram(movedProgram, fromMoved).out);
  ASSERT_EQ(version.size(), 2u);
  const std::string module = version[1].substr(std::string("module ").size());
  EXPECT_EQ(module.rfind(moved + "/", 0), 0u) << module;
  EXPECT_TRUE(fs::is_regular_file(module)) << module;
}

}  // namespace
}  // namespace cli_test
