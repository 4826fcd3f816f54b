// The conventions of the command line: help per command, the version, the manual page and the
// completion words, options on either side of the command.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "CliRun.h"

namespace cli_test {
namespace {

TEST(Options, HelpManualPageAndCompletionWordsComeFromTheCommandTables) {
  ExpectOutputsMatch({
      {"help.txt", {"--help"}},  // the commands only; hidden options stay hidden
      {"help-order.txt", {"order", "--help"}},
      {"help-units.txt", {"help", "units"}},
      {"manual.txt", {"--help-man"}},
      {"words-commands.txt", {"--help-words", "commands"}},
      {"words-color.txt", {"--help-words", "--color"}},
      {"words-order.txt", {"--help-words", "order"}},
  });
  EXPECT_EQ(RunQuillon({"help"}).out, RunQuillon({"--help"}).out);
  // The help flag before the command still asks for that command's help.
  EXPECT_EQ(RunQuillon({"--help", "check"}).out, RunQuillon({"check", "--help"}).out);
  EXPECT_NE(RunQuillon({"check", "-h"}).out.find("--warnings-as-errors"), std::string::npos);
}

TEST(Options, VersionNamesTheModuleItWouldLoad) {
  CliResult version = RunQuillon({"--version"});
  EXPECT_EQ(version.status, 0);
  EXPECT_EQ(version.out, "quillon " QUILLON_VERSION "\nmodule " QUILLON_MODULE_PATH "\n");
  CliResult overridden = RunQuillon(CliRun{{"--version"}, {}, {{"QUILLON_MODULE", "/elsewhere/libq.so"}}});
  EXPECT_EQ(Lines(overridden.out).back(), "module /elsewhere/libq.so");
}

TEST(Options, OptionsMayStandBeforeOrAfterTheCommand) {
  const std::string top = DataPath("mixed/top.vhd");
  CliResult before = RunQuillon({"--format", "json", "-l", "mine", "units", top});
  EXPECT_EQ(before.status, 0) << before.err;
  EXPECT_EQ(before.out, RunQuillon({"units", "--format", "json", "-l", "mine", top}).out);
  EXPECT_NE(before.out.find("\"library\": \"mine\""), std::string::npos) << before.out;
  // A library given after a source applies to the sources after it only.
  EXPECT_EQ(RunQuillon({"units", "--format", "json", top, "-l", "mine"}).out.find("mine"), std::string::npos);
}

TEST(Options, BashCompletionOffersCommandsOptionsAndValues) {
  const std::string script = ExamplePath("../apps/quillon/completion/quillon.bash");
  auto complete = [&](const std::string& words) {
    CliRun bash{{"-c", "source '" + script + "'; COMP_WORDS=('" QUILLON_CLI_PATH "' " + words +
                           "); COMP_CWORD=$((${#COMP_WORDS[@]} - 1)); _quillon; echo \"${COMPREPLY[*]}\""},
                {},
                {}};
    return RunProgram("/bin/bash", bash).out;
  };
  EXPECT_EQ(complete("or"), "order\n");
  EXPECT_EQ(complete("order --to"), "--top\n");
  EXPECT_EQ(complete("-P x.json check --warn"), "--warnings-as-errors\n");
  EXPECT_EQ(complete("units --format j"), "json\n");
}

}  // namespace
}  // namespace cli_test
