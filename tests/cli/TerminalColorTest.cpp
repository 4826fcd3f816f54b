// Colour of the severity words: on a terminal unless NO_COLOR is set, never into a file or pipe,
// and as --color says.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "CliRun.h"

namespace cli_test {
namespace {

const std::string kRedError = "\033[1;31merror\033[0m: ";

// An instance of an entity the project lacks: with --strict, an error.
std::string ErrorsOfUnresolvedInstance(std::vector<std::string> options, bool terminal,
                                       const std::string& noColor = "") {
  options.insert(options.begin(), {"check", "--strict", DataPath("unresolved/top.vhd")});
  CliRun run{options, {}, {{"NO_COLOR", noColor}}};
  run.errorToTerminal = terminal;
  return RunQuillon(run).err;
}

TEST(TerminalColor, SeveritiesAreColouredOnATerminalUnlessTurnedOff) {
  EXPECT_NE(ErrorsOfUnresolvedInstance({}, true).find(kRedError), std::string::npos);
  EXPECT_NE(ErrorsOfUnresolvedInstance({"--color", "always"}, false).find(kRedError), std::string::npos);
  for (const std::string& plain :
       {ErrorsOfUnresolvedInstance({}, false), ErrorsOfUnresolvedInstance({}, true, "1"),
        ErrorsOfUnresolvedInstance({"--color", "never"}, true)}) {
    EXPECT_NE(plain.find("error: "), std::string::npos) << plain;
    EXPECT_EQ(plain.find("\033["), std::string::npos) << plain;
  }

  const std::string top = DataPath("mixed/top.vhd");
  const std::string err = RunQuillon({"--color", "always", "units", top, top}).err;
  EXPECT_EQ(err.rfind("\033[1;35mWARNING: \033[0m", 0), 0u) << err;
}

}  // namespace
}  // namespace cli_test
