// The export command end to end: each format's text, and round trips through make, ninja and the
// simulators where they are installed.
#include <gtest/gtest.h>
#include <sys/wait.h>

#include <chrono>
#include <cstdio>
#include <filesystem>
#include <string>
#include <vector>

#include "CliRun.h"

namespace cli_test {
namespace {

namespace fs = std::filesystem;

struct ShellResult {
  int status = -1;
  std::string output;  // standard output and standard error
};

ShellResult RunShellIn(const std::string& dir, const std::string& command) {
  ShellResult result;
  FILE* pipe = popen(("cd '" + dir + "' && " + command + " 2>&1").c_str(), "r");
  if (!pipe) return result;
  char buffer[4096];
  for (std::size_t got; (got = std::fread(buffer, 1, sizeof buffer, pipe)) > 0;)
    result.output.append(buffer, got);
  int status = pclose(pipe);
  result.status = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
  return result;
}

bool OnPath(const std::string& tool) { return RunShellIn("/", "command -v " + tool).status == 0; }

// The file names that the compile commands of a make run name, in the order run.
std::vector<std::string> CompiledFiles(const std::string& makeOutput) {
  std::vector<std::string> names;
  for (const std::string& line : Lines(makeOutput)) {
    if (line.starts_with("ghdl ") || line.starts_with("iverilog "))
      names.push_back(fs::path(line.substr(line.rfind(' ') + 1)).filename().string());
  }
  return names;
}

const std::string kExample = ExamplePath("project.json");

TEST(Export, TextsCarryTheOrderLibrariesIncludeDirectoriesAndMacros) {
  const std::string verilog = DataPath("verilog");
  // A cycle's cut edge would make the stamps depend on each other; a Verilog file sees the macros of
  // the Verilog file before it.
  ExpectOutputsMatch({
      {"export-example-depfile.txt", {"-P", kExample, "export", "--to", "depfile"}},
      {"export-cycle-depfile.txt",
       {"-q", "export", "--to", "depfile", DataPath("cycle/ping.vhd"), DataPath("cycle/pong.vhd")}},
      {"export-verilog-depfile.txt", {"export", "--to", "depfile", "first.v", "second.v"}, 0, verilog},
      {"export-verilog-edam.json", {"export", "--to", "edam", "-f", "gated.f", "-D", "WIDTH=8"}, 0, verilog},
      {"export-controller-edam.json", {"-P", kExample, "export", "--to", "edam", "--top", "controller"}},
      // Tcl lists escape what Tcl would substitute.
      {"export-controller-tcl.txt",
       {"-P", kExample, "-D", "MSG=a [b] $c", "-I", "/tmp/inc dir", "export", "--to", "tcl", "--top",
        "Architecture|controller|rtl"}},
      {"order-verilog-defines.json",
       {"--format", "json", "order", "-f", "gated.f", "-D", "A=1", "-I", "include"},
       0,
       verilog},
  });
}

TEST(Export, MakefileRebuildsATouchedFileAndWhatDependsOnItOnly) {
  if (!OnPath("make") || !OnPath("ghdl") || !OnPath("iverilog"))
    GTEST_SKIP() << "make, ghdl or iverilog missing";
  ScopedTempDir dir;
  fs::copy(ExamplePath(""), dir.Path("examples"), fs::copy_options::recursive);
  CliResult exported = RunQuillon(
      {"-P", dir.Path("examples/project.json"), "export", "--to", "make", "-o", dir.Path("Makefile")});
  ASSERT_EQ(exported.status, 0) << exported.err;
  ShellResult built = RunShellIn(dir.path(), "make");
  ASSERT_EQ(built.status, 0) << built.output;
  EXPECT_EQ(CompiledFiles(built.output).size(), 8u) << built.output;
  EXPECT_EQ(CompiledFiles(RunShellIn(dir.path(), "make -n").output), std::vector<std::string>{});

  fs::last_write_time(dir.Path("examples/rtl/light_pkg.vhd"),
                      fs::file_time_type::clock::now() + std::chrono::seconds(10));
  ShellResult again = RunShellIn(dir.path(), "make -n");
  EXPECT_EQ(again.status, 0) << again.output;
  EXPECT_EQ(CompiledFiles(again.output),
            (std::vector<std::string>{"light_pkg.vhd", "lamp_driver.vhd", "controller.vhd", "crossing.vhd"}));
}

// Each tool's file, exported into a folder of its own, and the tool run on it there where installed.
TEST(Export, ToolFilesHoldTheOrderAndTheToolsAcceptThem) {
  struct Case {
    std::vector<std::string> args;
    std::string file, expected, command;
    std::vector<std::string>
        evidence;  // "FILE#TEXT": the tool wrote FILE holding TEXT; no FILE: it printed TEXT
  };
  const Case cases[] = {
      {{"-P", kExample, "export", "--to", "ninja"},
       "build.ninja",
       "export-example-ninja.txt",
       "ninja -n",
       {"#[8/8]"}},
      {{"-P", kExample, "export", "--to", "ghdl", "--top", "crossing"},
       "analyse.sh",
       "export-crossing-ghdl.txt",
       "sh analyse.sh",
       {".quillon-build/ghdl/common-obj08.cf#", ".quillon-build/ghdl/work-obj08.cf#"}},
      {{"export", "--to", "iverilog", "-f", "gated.f", "first.v", "second.v"},
       "files.cmd",
       "export-verilog-iverilog.txt",
       "iverilog -g2012 -o design.vvp -c files.cmd",
       {"design.vvp#\"from_include\"", "design.vvp#\"from_command_line\"", "design.vvp#\"second\""}},
  };
  for (const Case& each : cases) {
    SCOPED_TRACE(each.expected);
    ScopedTempDir dir;
    CliRun run{each.args, DataPath("verilog"), {}};
    run.args.insert(run.args.end(), {"-o", dir.Path(each.file)});
    CliResult exported = RunQuillon(run);
    ASSERT_EQ(exported.status, 0) << exported.err;
    ExpectOutputMatches(ReadText(dir.Path(each.file)), each.expected, dir.path());
    const std::string tool = each.command.substr(0, each.command.find(' '));
    if (!OnPath(tool)) continue;
    ShellResult ran = RunShellIn(dir.path(), each.command);
    EXPECT_EQ(ran.status, 0) << ran.output;
    for (const std::string& evidence : each.evidence) {
      const std::string file = evidence.substr(0, evidence.find('#'));
      if (!file.empty()) {
        EXPECT_TRUE(fs::exists(dir.Path(file))) << file;
      }
      EXPECT_NE((file.empty() ? ran.output : ReadText(dir.Path(file))).find(evidence.substr(file.size() + 1)),
                std::string::npos)
          << evidence << "\n"
          << ran.output;
    }
  }
}

TEST(Export, PathsMakeCannotNameAreRefusedWhileScriptsQuoteThem) {
  ScopedTextFile source("entity spaced is\nend entity spaced;\n", "my unit.vhd");
  CliResult make = RunQuillon({"export", "--to", "make", source.path()});
  EXPECT_EQ(make.status, 1);
  EXPECT_NE(make.err.find(source.path() + " into a Makefile"), std::string::npos) << make.err;
  EXPECT_EQ(make.out, "");

  CliResult ghdl = RunQuillon({"export", "--to", "ghdl", source.path()});
  EXPECT_EQ(ghdl.status, 0) << ghdl.err;
  EXPECT_NE(ghdl.out.find("ghdl_run -a work '" + source.path() + "'\n"), std::string::npos) << ghdl.out;
  EXPECT_NE(RunQuillon({"export", "--to", "depfile", source.path()}).out.find("my\\ unit.vhd"),
            std::string::npos);
}

TEST(Export, DepfileEscapesWhatMakeAndNinjaWouldSplitOrExpand) {
  ScopedTextFile source("entity odd is\nend entity odd;\n", "a:b #1 $x\\ y.vhd");
  CliResult depfile = RunQuillon({"export", "--to", "depfile", source.path()});
  ASSERT_EQ(depfile.status, 0) << depfile.err;
  const std::string directory = source.path().substr(0, source.path().rfind('/') + 1);
  const std::string escaped = directory + "a\\:b\\ \\#1\\ $$x\\\\\\ y.vhd\n";
  EXPECT_TRUE(depfile.out.starts_with(".quillon-build/")) << depfile.out;
  EXPECT_TRUE(depfile.out.ends_with(".stamp: " + escaped)) << depfile.out;
}

TEST(Export, SourcesNoToolCompilesAreLeftOutWithAWarning) {
  ScopedTextFile netlist("MODULE block 1\n", "block.hrf");
  CliResult result = RunQuillon({"export", "--to", "tcl", netlist.path(), DataPath("mixed/lane.vhd")});
  EXPECT_EQ(result.status, 0) << result.err;
  EXPECT_NE(result.err.find(netlist.path() + " is left out of the export"), std::string::npos) << result.err;
  EXPECT_EQ(result.out.find("block.hrf"), std::string::npos);
  EXPECT_NE(result.out.find("  {work " + DataPath("mixed/lane.vhd") + " vhdl}\n"), std::string::npos)
      << result.out;
}

}  // namespace
}  // namespace cli_test
