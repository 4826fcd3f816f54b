// Usage and bad input: every mistake gets one line naming what is wrong (with the closest names when
// something is misspelt) and exit status 2, never a crash.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "CliRun.h"

namespace cli_test {
namespace {

TEST(CommandLine, UsageMistakesAreRejectedWithTheClosestNames) {
  const std::string top = DataPath("mixed/top.vhd"), project = DataPath("mixed/project.json");
  ExpectAllRejected({
      {{}, "no command"},
      {{"ordr", "-P", project}, "unknown command 'ordr'; did you mean 'order'?"},
      {{"compile", top}, "unknown command 'compile' (see"},
      {{"order", "--tpo", "top", "-P", project}, "unknown option '--tpo'; did you mean '--to' or '--top'?"},
      {{"--strickt", "check", "-P", project}, "unknown option '--strickt'; did you mean '--strict'?"},
      {{"--frobnicate", "units", top}, "unknown option '--frobnicate' (see"},
      {{"units"}, "no sources"},
      {{"ports"}, "UNIT"},
      {{"--color", "sometimes", "units", top}, "--color: 'sometimes' is not one of auto always never"},
      {{"units", "--format", "xml", top}, "--format: 'xml' is not one of text json dot"},
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
      {{"export", "-P", project}, "--to"},
      {{"order", "--to", "make", "-P", project}, "--to"},
      {{"export", "--to", "cmake", "-P", project}, "cmake"},
  });
}

TEST(CommandLine, UnknownUnitsAreRejectedWithTheClosestNames) {
  const std::string project = DataPath("mixed/project.json");
  ExpectAllRejected({
      {{"order", "--top", "croe", "-P", project}, "unknown design unit 'croe'; did you mean 'core'?"},
      {{"ports", "Entity|tpo", "-P", project},
       "unknown design unit 'Entity|tpo'; did you mean 'Entity|top'?"},
      {{"ports", "zzzzzz", "-P", project}, "unknown design unit 'zzzzzz'"},
      {{"order", "--unit", "Entity|nowhere", "-P", project}, "unknown design unit 'Entity|nowhere'"},
      {{"tree", "--top", "nothing", "-P", project}, "unknown design unit 'nothing'"},
  });
  CliResult result = RunQuillon({"ports", "zzzzzz", "-P", project});
  EXPECT_EQ(result.err.find("did you mean"), std::string::npos) << result.err;
}

TEST(CommandLine, UnreadableSourcesAndListsAreRejectedNamingFileAndLine) {
  ScopedTextFile missing("lane.vhd\nnot_here.vhd\n");
  ScopedTextFile plus("+libext+.v\n+nosuch+1\n");
  ScopedTextFile library("rtl/top.v\n-y lib\n  -v cells/absent.v\n");
  ScopedTextFile unset("rtl/top.v\n$NOT_SET_ANYWHERE/a.v\n");
  ScopedTextFile directoryEntry("{\"files\": [{\"path\": \"" + DataPath("mixed") + "\"}]}", "project.json");
  const std::string libsearch = DataPath("libsearch");
  ExpectAllRejected({
      {{"units", "-P", directoryEntry.path()}, DataPath("mixed") + " is a directory, not a source file"},
      {{"units", DataPath("mixed/absent.vhd")}, "no such source file: " + DataPath("mixed/absent.vhd")},
      {{"units", "-P", DataPath("absent.json")}, "cannot read project file " + DataPath("absent.json")},
      {{"units", "-P", DataPath("mixed")}, "cannot read project file " + DataPath("mixed")},
      {{"units", "-P", DataPath("broken.json")}, DataPath("broken.json") + " is not a valid project file"},
      {{"units", "-P", DataPath("wrong_shape.json")}, "\"files\" must be an array"},
      {{"units", "-P", DataPath("missing_source.json")}, "no such source file: " + DataPath("missing.vhd")},
      {{"units", "-f", DataPath("absent.f")}, "cannot read file list " + DataPath("absent.f")},
      {{"units", "-o", DataPath("no/such/dir/out.json"), DataPath("mixed/top.vhd")}, "cannot write"},
      {{"units", "-f", missing.path()},
       missing.path() + ":2: no such source file: " + DataPath("mixed/not_here.vhd"),
       DataPath("mixed")},
      {{"units", "-f", plus.path()}, plus.path() + ":2: unknown list option +nosuch+1"},
      {{"units", "-f", library.path()},
       library.path() + ":3: no such library file: cells/absent.v",
       libsearch},
      {{"units", "-f", unset.path()},
       unset.path() + ":2: the environment variable NOT_SET_ANYWHERE is not set",
       libsearch},
      {{"units", "rtl/*.vhd"}, "no file matches the pattern rtl/*.vhd", libsearch},
  });
}

}  // namespace
}  // namespace cli_test
