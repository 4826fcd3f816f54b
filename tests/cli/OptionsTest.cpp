// The conventions of the command line: help per command, the version, and "did you mean".
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "CliRun.h"

namespace cli_test {
namespace {

bool Has(const std::string& text, const std::string& part) { return text.find(part) != std::string::npos; }

TEST(Options, EachCommandHasItsOwnHelp) {
  CliResult order = RunQuillon({"order", "--help"});
  EXPECT_EQ(order.status, 0);
  for (const char* option : {"--top", "--unit", "--with-library", "--project", "--format", "--strict"})
    EXPECT_TRUE(Has(order.out, option)) << option;
  EXPECT_FALSE(Has(order.out, "--warnings-as-errors")) << order.out;
  EXPECT_TRUE(Has(order.out, "an entity, every file of the design, ordered from the root")) << order.out;

  CliResult units = RunQuillon({"help", "units"});
  EXPECT_EQ(units.status, 0);
  EXPECT_TRUE(Has(units.out, "--library"));
  EXPECT_FALSE(Has(units.out, "--top")) << units.out;

  // The help flag before the command still asks for that command's help.
  EXPECT_EQ(RunQuillon({"--help", "check"}).out, RunQuillon({"check", "--help"}).out);
  EXPECT_TRUE(Has(RunQuillon({"check", "-h"}).out, "--warnings-as-errors"));
}

TEST(Options, GeneralHelpListsTheCommandsOnly) {
  CliResult help = RunQuillon({"--help"});
  EXPECT_EQ(help.status, 0);
  for (const char* command :
       {"units", "tree", "order", "ports", "check", "factories", "--version", "--color"})
    EXPECT_TRUE(Has(help.out, command)) << command;
  EXPECT_FALSE(Has(help.out, "--top"));
  EXPECT_FALSE(Has(help.out, "--help-man")) << "hidden options stay hidden";
  EXPECT_EQ(RunQuillon({"help"}).out, help.out);
}

TEST(Options, VersionNamesTheModuleItWouldLoad) {
  CliResult version = RunQuillon({"--version"});
  EXPECT_EQ(version.status, 0);
  EXPECT_EQ(version.out, "quillon " QUILLON_VERSION "\nmodule " QUILLON_MODULE_PATH "\n");
  CliResult overridden = RunQuillon(CliRun{{"--version"}, {}, {{"QUILLON_MODULE", "/elsewhere/libq.so"}}});
  EXPECT_TRUE(Has(overridden.out, "module /elsewhere/libq.so\n")) << overridden.out;
}

TEST(Options, MisspeltCommandsOptionsAndUnitsGetTheClosestNames) {
  const std::string project = DataPath("mixed/project.json");
  struct Case {
    std::vector<std::string> args;
    std::string message;
  };
  const std::vector<Case> cases = {
      {{"ordr", "-P", project}, "unknown command 'ordr'; did you mean 'order'?"},
      {{"compile", "-P", project}, "unknown command 'compile' (see"},
      {{"order", "--tpo", "top", "-P", project}, "unknown option '--tpo'; did you mean '--to' or '--top'?"},
      {{"--strickt", "check", "-P", project}, "unknown option '--strickt'; did you mean '--strict'?"},
      {{"--frobnicate", "units", "-P", project}, "unknown option '--frobnicate' (see"},
      {{"order", "--top", "croe", "-P", project}, "unknown design unit 'croe'; did you mean 'core'?"},
      {{"ports", "Entity|tpo", "-P", project},
       "unknown design unit 'Entity|tpo'; did you mean 'Entity|top'?"},
      {{"ports", "zzzzzz", "-P", project}, "unknown design unit 'zzzzzz'\n"},
      {{"--color", "sometimes", "units", "-P", project},
       "--color: 'sometimes' is not one of auto always never"},
      {{"units", "--format", "xml", "-P", project}, "--format: 'xml' is not one of text json dot"},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.message);
    CliResult result = RunQuillon(c.args);
    EXPECT_EQ(result.status, 2);
    EXPECT_TRUE(Has(result.err, c.message)) << result.err;
    EXPECT_EQ(Lines(result.err).size(), 1u) << result.err;
  }
}

TEST(Options, OptionsMayStandBeforeOrAfterTheCommand) {
  const std::string top = DataPath("mixed/top.vhd");
  CliResult before = RunQuillon({"--format", "json", "-l", "mine", "units", top});
  CliResult after = RunQuillon({"units", "--format", "json", "-l", "mine", top});
  EXPECT_EQ(before.status, 0) << before.err;
  EXPECT_EQ(before.out, after.out);
  EXPECT_TRUE(Has(before.out, "\"library\": \"mine\"") || Has(before.out, "\"library\":\"mine\""))
      << before.out;
  // A library given after a source applies to the sources after it only.
  CliResult late = RunQuillon({"units", "--format", "json", top, "-l", "mine"});
  EXPECT_FALSE(Has(late.out, "mine")) << late.out;
}

TEST(Options, ManualPageAndCompletionWordsComeFromTheSameTables) {
  CliResult man = RunQuillon({"--help-man"});
  EXPECT_EQ(man.status, 0);
  EXPECT_EQ(man.out.rfind(".TH QUILLON 1", 0), 0u);
  for (const char* part : {"\\fB\\-\\-top\\fR \\fIUNIT\\fR", ".SH EXIT STATUS", "(order only)"})
    EXPECT_TRUE(Has(man.out, part)) << part;

  EXPECT_EQ(Lines(RunQuillon({"--help-words", "commands"}).out),
            (std::vector<std::string>{"units", "tree", "order", "ports", "check", "factories", "export",
                                      "watch", "help"}));
  EXPECT_EQ(Lines(RunQuillon({"--help-words", "--color"}).out),
            (std::vector<std::string>{"auto", "always", "never"}));
  std::vector<std::string> orderWords = Lines(RunQuillon({"--help-words", "order"}).out);
  for (const char* word : {"--top", "-P", "--project", "--color", "--help"})
    EXPECT_NE(std::find(orderWords.begin(), orderWords.end(), word), orderWords.end()) << word;
  EXPECT_EQ(std::find(orderWords.begin(), orderWords.end(), "--warnings-as-errors"), orderWords.end());
}

TEST(Options, BashCompletionOffersCommandsOptionsAndValues) {
  const std::string script =
      std::string(QUILLON_TEST_DATA_DIR) + "/../../apps/quillon/completion/quillon.bash";
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
