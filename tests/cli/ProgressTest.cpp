// Progress of long runs: a line that counts the files, on a terminal only.
#include <gtest/gtest.h>

#include <fstream>
#include <string>
#include <vector>

#include "CliRun.h"

namespace cli_test {
namespace {

TEST(Progress, LargeProjectsCountTheFilesOnATerminalOnly) {
  ScopedTempDir dir;
  CliRun run{{"units"}, {}, {}};
  for (int i = 0; i < 50; ++i) {
    run.args.push_back(dir.Path("unit" + std::to_string(i) + ".vhd"));
    std::ofstream(run.args.back()) << "entity unit" << i << " is end entity;\n";
  }
  run.errorToTerminal = true;
  CliResult terminal = RunQuillon(run);
  EXPECT_EQ(terminal.status, 0) << terminal.err;
  EXPECT_NE(terminal.err.find("quillon: parsing 1/50"), std::string::npos) << terminal.err;
  EXPECT_NE(terminal.err.find("quillon: parsing 50/50"), std::string::npos) << terminal.err;
  EXPECT_TRUE(terminal.err.ends_with("\r\033[K")) << "the line is taken off at the end";

  run.args.insert(run.args.begin(), "-q");
  EXPECT_EQ(RunQuillon(run).err, "");
  run.args.erase(run.args.begin());
  run.errorToTerminal = false;
  EXPECT_EQ(RunQuillon(run).err, "");
}

}  // namespace
}  // namespace cli_test
