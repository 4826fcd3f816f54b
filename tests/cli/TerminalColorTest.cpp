// Colour of the severity words: on a terminal unless NO_COLOR is set, never into a file or pipe,
// and as --color says.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "CliRun.h"

namespace cli_test {
namespace {

constexpr const char* kEscape = "\033[";

// An instance of an entity the project lacks: a diagnostic from quillon and, with --strict, an error.
CliResult RunOnUnresolvedInstance(std::vector<std::string> options, bool terminal,
                                  std::vector<std::pair<std::string, std::string>> environment = {}) {
  ScopedTextFile source(
      "entity top is end entity;\n"
      "architecture rtl of top is begin\n"
      "  u : entity work.absent;\n"
      "end architecture;\n",
      "top.vhd");
  std::vector<std::string> args{"check", "--strict"};
  args.insert(args.end(), options.begin(), options.end());
  args.push_back(source.path());
  CliRun run{args, {}, std::move(environment)};
  run.errorToTerminal = terminal;
  return RunQuillon(run);
}

TEST(TerminalColor, SeveritiesAreColouredOnATerminalOnly) {
  CliResult terminal = RunOnUnresolvedInstance({}, true, {{"NO_COLOR", ""}});
  EXPECT_NE(terminal.err.find(std::string(kEscape) + "1;31merror" + kEscape + "0m: "), std::string::npos)
      << terminal.err;

  CliResult file = RunOnUnresolvedInstance({}, false);
  EXPECT_NE(file.err.find("error: "), std::string::npos) << file.err;
  EXPECT_EQ(file.err.find(kEscape), std::string::npos) << file.err;
}

TEST(TerminalColor, NoColorAndColorNeverTurnItOffAndColorAlwaysOn) {
  CliResult noColor = RunOnUnresolvedInstance({}, true, {{"NO_COLOR", "1"}});
  EXPECT_NE(noColor.err.find("error: "), std::string::npos) << noColor.err;
  EXPECT_EQ(noColor.err.find(kEscape), std::string::npos) << noColor.err;

  CliResult never = RunOnUnresolvedInstance({"--color", "never"}, true, {{"NO_COLOR", ""}});
  EXPECT_EQ(never.err.find(kEscape), std::string::npos) << never.err;

  CliResult always = RunOnUnresolvedInstance({"--color", "always"}, false);
  EXPECT_NE(always.err.find(std::string(kEscape) + "1;31merror"), std::string::npos) << always.err;
}

TEST(TerminalColor, MessagePrefixesAreColoured) {
  const std::string top = DataPath("mixed/top.vhd");
  CliResult result = RunQuillon({"--color", "always", "units", top, top});
  std::vector<std::string> lines = Lines(result.err);
  ASSERT_FALSE(lines.empty()) << result.err;
  EXPECT_EQ(lines[0].rfind(std::string(kEscape) + "1;35mWARNING: " + kEscape + "0m", 0), 0u) << result.err;
}

}  // namespace
}  // namespace cli_test
