// Usage and bad input: every mistake gets one line naming what is wrong and exit status 2 (1 where
// the module reports the failure), never a crash.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "CliRun.h"

namespace cli_test {
namespace {

struct BadInput {
  std::vector<std::string> args;
  std::string named;  // what the message must name
};

void ExpectOneLineNaming(const CliResult& result, const std::string& named) {
  EXPECT_EQ(result.status, 2) << result.err;
  EXPECT_EQ(result.out, "");
  std::vector<std::string> lines = Lines(result.err);
  ASSERT_EQ(lines.size(), 1u) << result.err;
  EXPECT_EQ(lines[0].rfind("quillon: ", 0), 0u) << lines[0];
  EXPECT_NE(lines[0].find(named), std::string::npos) << lines[0];
}

TEST(CommandLine, UsageMistakesAreRejectedWithStatusTwo) {
  const std::string top = DataPath("mixed/top.vhd");
  const std::vector<BadInput> cases = {
      {{}, "no command"},
      {{"compile", top}, "unknown command 'compile'"},
      {{"--frobnicate", "units", top}, "--frobnicate"},
      {{"units"}, "no sources"},
      {{"ports"}, "UNIT"},
      {{"--format", "xml", "units", top}, "xml"},
      {{"--format", "dot", "units", top}, "--format dot"},
      {{"--top", "top", "units", top}, "--top"},
      {{"--top", "top", "--unit", "top", "order", top}, "--unit"},
      {{"--unit", "top", "tree", top}, "--unit"},
      {{"--depth", "1", "order", top}, "--depth"},
      {{"--instances", "units", top}, "--instances"},
      {{"--depth", "-1", "tree", top}, "--depth"},
      {{"--property", "NOVALUE", "units", top}, "NOVALUE"},
      {{"-D", "=1", "units", top}, "-D"},
      {{"units", top, "-l", "common"}, "-l common applies to no source"},
      {{"units", top, "--plugin", "PLUGIN_Vhdl"}, "--plugin PLUGIN_Vhdl applies to no source"},
      {{"units", "--lib", "common"}, "--lib needs NAME=PATH"},
  };
  for (const BadInput& bad : cases) {
    SCOPED_TRACE(bad.named);
    ExpectOneLineNaming(RunQuillon(bad.args), bad.named);
  }
}

TEST(CommandLine, UnreadableSourcesAreRejectedWithStatusTwo) {
  const std::vector<BadInput> cases = {
      {{"units", DataPath("mixed/absent.vhd")}, "no such source file: " + DataPath("mixed/absent.vhd")},
      {{"units", "-P", DataPath("absent.json")}, "cannot read project file " + DataPath("absent.json")},
      {{"units", "-P", DataPath("mixed")}, "cannot read project file " + DataPath("mixed")},
      {{"units", "-P", DataPath("broken.json")}, DataPath("broken.json") + " is not a valid project file"},
      {{"units", "-P", DataPath("wrong_shape.json")}, "\"files\" must be an array"},
      {{"units", "-P", DataPath("missing_source.json")}, "no such source file: " + DataPath("missing.vhd")},
      {{"units", "-f", DataPath("absent.f")}, "cannot read file list " + DataPath("absent.f")},
      {{"units", "-o", DataPath("no/such/dir/out.json"), DataPath("mixed/top.vhd")}, "cannot write"},
  };
  for (const BadInput& bad : cases) {
    SCOPED_TRACE(bad.named);
    ExpectOneLineNaming(RunQuillon(bad.args), bad.named);
  }
}

TEST(CommandLine, ProjectEntryThatIsADirectoryIsRejected) {
  ScopedTextFile project("{\"files\": [{\"path\": \"" + DataPath("mixed") + "\"}]}", "project.json");
  ExpectOneLineNaming(RunQuillon({"units", "-P", project.path()}),
                      DataPath("mixed") + " is a directory, not a source file");
}

TEST(CommandLine, FileListNamesTheLineOfAMissingSource) {
  ScopedTextFile list("lane.vhd\nnot_here.vhd\n");
  CliResult result = RunQuillon(CliRun{{"units", "-f", list.path()}, DataPath("mixed"), {}});
  ExpectOneLineNaming(result, list.path() + ":2: no such source file: " + DataPath("mixed/not_here.vhd"));
}

TEST(CommandLine, FileListRejectsAnUnknownPlusOption) {
  ScopedTextFile list("+libext+.v\n+nosuch+1\n");
  ExpectOneLineNaming(RunQuillon({"units", "-f", list.path()}),
                      list.path() + ":2: unknown list option +nosuch+1");
}

TEST(CommandLine, UnknownUnitIsBadInput) {
  const std::string project = DataPath("mixed/project.json");
  ExpectOneLineNaming(RunQuillon({"order", "--top", "nowhere", "-P", project}),
                      "unknown design unit 'nowhere'");
  ExpectOneLineNaming(RunQuillon({"order", "--unit", "Entity|nowhere", "-P", project}),
                      "unknown design unit 'Entity|nowhere'");
  ExpectOneLineNaming(RunQuillon({"ports", "nowhere", "-P", project}), "unknown design unit 'nowhere'");
}

}  // namespace
}  // namespace cli_test
