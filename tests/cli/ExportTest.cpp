// The export command end to end: each format's structure, and round trips through make, GHDL and
// Icarus Verilog where they are installed.
#include <gtest/gtest.h>
#include <sys/wait.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "CliRun.h"

namespace cli_test {
namespace {

namespace fs = std::filesystem;
using Json = nlohmann::json;

struct ShellResult {
  int status = -1;
  std::string output;  // standard output and standard error
};

ShellResult RunShell(const std::string& command) {
  ShellResult result;
  FILE* pipe = popen((command + " 2>&1").c_str(), "r");
  if (!pipe) return result;
  char buffer[4096];
  for (std::size_t got; (got = std::fread(buffer, 1, sizeof buffer, pipe)) > 0;)
    result.output.append(buffer, got);
  int status = pclose(pipe);
  result.status = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
  return result;
}

bool OnPath(const std::string& tool) { return RunShell("command -v " + tool).status == 0; }

std::string ReadText(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  return std::string(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
}

std::string Example(const std::string& name) {
  static const std::string examples =
      fs::weakly_canonical(fs::path(QUILLON_TEST_DATA_DIR) / ".." / ".." / "examples").string();
  return examples + "/" + name;
}

// The file names that the compile commands of a make run name, in the order run.
std::vector<std::string> CompiledFiles(const std::string& makeOutput) {
  std::vector<std::string> names;
  for (const std::string& line : Lines(makeOutput)) {
    if (!line.starts_with("ghdl ") && !line.starts_with("iverilog ")) continue;
    names.push_back(fs::path(line.substr(line.rfind(' ') + 1)).filename().string());
  }
  return names;
}

TEST(Export, MakefileRebuildsATouchedFileAndWhatDependsOnItOnly) {
  if (!OnPath("make") || !OnPath("ghdl") || !OnPath("iverilog"))
    GTEST_SKIP() << "make, ghdl or iverilog missing";
  ScopedTempDir dir;
  fs::copy(Example(""), dir.Path("examples"), fs::copy_options::recursive);
  CliResult exported = RunQuillon(
      {"-P", dir.Path("examples/project.json"), "export", "--to", "make", "-o", dir.Path("Makefile")});
  ASSERT_EQ(exported.status, 0) << exported.err;
  ShellResult built = RunShell("cd '" + dir.path() + "' && make");
  ASSERT_EQ(built.status, 0) << built.output;
  EXPECT_EQ(CompiledFiles(built.output).size(), 8u) << built.output;
  EXPECT_EQ(CompiledFiles(RunShell("cd '" + dir.path() + "' && make -n").output), std::vector<std::string>{});

  fs::last_write_time(dir.Path("examples/rtl/light_pkg.vhd"),
                      fs::file_time_type::clock::now() + std::chrono::seconds(10));
  ShellResult again = RunShell("cd '" + dir.path() + "' && make -n");
  EXPECT_EQ(again.status, 0) << again.output;
  EXPECT_EQ(CompiledFiles(again.output),
            (std::vector<std::string>{"light_pkg.vhd", "lamp_driver.vhd", "controller.vhd", "crossing.vhd"}));
}

TEST(Export, DepfileAndNinjaCarryTheSameNeedsAsTheMakefile) {
  CliResult depfile = RunQuillon({"-P", Example("project.json"), "export", "--to", "depfile"});
  ASSERT_EQ(depfile.status, 0) << depfile.err;
  std::vector<std::string> lines = Lines(depfile.out);
  ASSERT_EQ(lines.size(), 8u);
  EXPECT_EQ(lines[0], ".quillon-build/common.timing_pkg.vhd.stamp: " + Example("common/timing_pkg.vhd"));
  EXPECT_EQ(lines[5],
            ".quillon-build/work.controller.vhd.stamp: " + Example("rtl/controller.vhd") +
                " .quillon-build/work.phase_timer.vhd.stamp .quillon-build/work.light_pkg.vhd.stamp");

  ScopedTempDir dir;
  CliResult ninja =
      RunQuillon({"-P", Example("project.json"), "export", "--to", "ninja", "-o", dir.Path("build.ninja")});
  ASSERT_EQ(ninja.status, 0) << ninja.err;
  std::string text = ReadText(dir.Path("build.ninja"));
  EXPECT_NE(
      text.find(
          "build $build_dir/work.controller.vhd.stamp: vhdl " + Example("rtl/controller.vhd") +
          " | $build_dir/work.phase_timer.vhd.stamp $build_dir/work.light_pkg.vhd.stamp\n  lib = work\n"),
      std::string::npos)
      << text;
  if (!OnPath("ninja")) GTEST_SKIP() << "ninja missing";
  ShellResult plan = RunShell("cd '" + dir.path() + "' && ninja -n");
  EXPECT_EQ(plan.status, 0) << plan.output;
  EXPECT_NE(plan.output.find("[8/8]"), std::string::npos) << plan.output;
}

// A cycle's cut edge would make the stamps depend on each other; a Verilog file sees the macros
// of the Verilog file before it.
TEST(Export, StampsNeedOnlyEarlierSourcesAndVerilogTheVerilogBefore) {
  CliResult cycle =
      RunQuillon({"-q", "export", "--to", "depfile", DataPath("cycle/ping.vhd"), DataPath("cycle/pong.vhd")});
  ASSERT_EQ(cycle.status, 0) << cycle.err;
  EXPECT_EQ(Lines(cycle.out),
            (std::vector<std::string>{".quillon-build/work.pong.vhd.stamp: " + DataPath("cycle/pong.vhd"),
                                      ".quillon-build/work.ping.vhd.stamp: " + DataPath("cycle/ping.vhd") +
                                          " .quillon-build/work.pong.vhd.stamp"}));
  CliResult verilog =
      RunQuillon({"export", "--to", "depfile", DataPath("verilog/first.v"), DataPath("verilog/second.v")});
  EXPECT_EQ(Lines(verilog.out).back(), ".quillon-build/work.second.v.stamp: " + DataPath("verilog/second.v") +
                                           " .quillon-build/work.first.v.stamp");
}

TEST(Export, GhdlScriptAnalysesTheExampleInOrderAndElaboratesTheTop) {
  ScopedTempDir dir;
  CliResult exported = RunQuillon({"-P", Example("project.json"), "export", "--to", "ghdl", "--top",
                                   "crossing", "-o", dir.Path("analyse.sh")});
  ASSERT_EQ(exported.status, 0) << exported.err;
  std::vector<std::string> lines = Lines(ReadText(dir.Path("analyse.sh")));
  EXPECT_EQ(lines.front(), "#!/bin/sh");
  EXPECT_NE(std::find(lines.begin(), lines.end(), "ghdl_run -a common " + Example("common/timing_pkg.vhd")),
            lines.end());
  EXPECT_NE(std::find(lines.begin(), lines.end(), "# not VHDL, for another tool: " + Example("rtl/chime.v")),
            lines.end());
  EXPECT_EQ(lines.back(), "ghdl_run -e work crossing");

  if (!OnPath("ghdl")) GTEST_SKIP() << "ghdl missing";
  ShellResult run = RunShell("cd '" + dir.path() + "' && sh analyse.sh");
  EXPECT_EQ(run.status, 0) << run.output;
  EXPECT_TRUE(fs::exists(dir.Path(".quillon-build/ghdl/common-obj08.cf")));
  EXPECT_TRUE(fs::exists(dir.Path(".quillon-build/ghdl/work-obj08.cf")));
}

TEST(Export, IverilogCommandFileCompilesWithIncludeDirectoriesAndMacros) {
  ScopedTempDir dir;
  CliResult exported = RunQuillon(CliRun{
      {"export", "--to", "iverilog", "-f", "gated.f", "first.v", "second.v", "-o", dir.Path("files.cmd")},
      DataPath("verilog"),
      {}});
  ASSERT_EQ(exported.status, 0) << exported.err;
  EXPECT_EQ(Lines(ReadText(dir.Path("files.cmd"))),
            (std::vector<std::string>{"# Icarus Verilog command file: iverilog -g2012 -c THIS_FILE",
                                      "+incdir+" + DataPath("verilog/include"), "+define+FROM_COMMAND_LINE",
                                      DataPath("verilog/gated.v"), DataPath("verilog/first.v"),
                                      DataPath("verilog/second.v")}));

  if (!OnPath("iverilog")) GTEST_SKIP() << "iverilog missing";
  ShellResult compiled = RunShell("cd '" + dir.path() + "' && iverilog -g2012 -o design.vvp -c files.cmd");
  ASSERT_EQ(compiled.status, 0) << compiled.output;
  std::string design = ReadText(dir.Path("design.vvp"));
  for (const char* module : {"\"from_include\"", "\"from_command_line\"", "\"second\""})
    EXPECT_NE(design.find(module), std::string::npos) << module;
}

TEST(Export, EdamCarriesTypesLibrariesIncludeFilesMacrosAndTheTop) {
  CliResult verilog = RunQuillon(
      CliRun{{"export", "--to", "edam", "-f", "gated.f", "-D", "WIDTH=8"}, DataPath("verilog"), {}});
  ASSERT_EQ(verilog.status, 0) << verilog.err;
  Json edam = Json::parse(verilog.out);
  EXPECT_EQ(edam["files"][0], (Json{{"name", DataPath("verilog/include/options.vh")},
                                    {"file_type", "verilogSource"},
                                    {"is_include_file", true},
                                    {"include_path", DataPath("verilog/include")}}));
  EXPECT_EQ(edam["files"][1]["name"], DataPath("verilog/gated.v"));
  EXPECT_EQ(edam["files"][1]["is_include_file"], false);
  EXPECT_EQ(edam["parameters"]["FROM_COMMAND_LINE"],
            (Json{{"datatype", "bool"}, {"default", true}, {"paramtype", "vlogdefine"}}));
  EXPECT_EQ(edam["parameters"]["WIDTH"]["default"], "8");
  EXPECT_FALSE(edam.contains("toplevel"));

  CliResult vhdl =
      RunQuillon({"-P", Example("project.json"), "export", "--to", "edam", "--top", "controller"});
  ASSERT_EQ(vhdl.status, 0) << vhdl.err;
  edam = Json::parse(vhdl.out);
  EXPECT_EQ(edam["toplevel"], "controller");
  ASSERT_EQ(edam["files"].size(), 4u);  // what order --top controller gives
  EXPECT_EQ(edam["files"][0]["logical_name"], "common");
  EXPECT_EQ(edam["files"][0]["file_type"], "vhdlSource-2008");
}

TEST(Export, TclListsEscapeWhatTclWouldSubstitute) {
  CliResult result = RunQuillon({"-P", Example("project.json"), "-D", "MSG=a [b] $c", "-I", "/tmp/inc dir",
                                 "export", "--to", "tcl", "--top", "Architecture|controller|rtl"});
  ASSERT_EQ(result.status, 0) << result.err;
  std::vector<std::string> lines = Lines(result.out);
  ASSERT_EQ(lines.size(), 10u) << result.out;
  EXPECT_EQ(lines[1], "set quillon_files {");
  EXPECT_EQ(lines[2], "  {common " + Example("common/timing_pkg.vhd") + " vhdl}");
  EXPECT_EQ(lines[7], "set quillon_incdirs {/tmp/inc\\ dir}");
  EXPECT_EQ(lines[8], "set quillon_defines {MSG=a\\ \\[b\\]\\ \\$c}");
  EXPECT_EQ(lines[9], "set quillon_top {work controller rtl}");
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
  CliResult depfile = RunQuillon({"export", "--to", "depfile", source.path()});
  EXPECT_NE(depfile.out.find("my\\ unit.vhd"), std::string::npos) << depfile.out;
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

TEST(Export, NeedsAFormatAndWarnsAboutSourcesNoToolCompiles) {
  EXPECT_EQ(RunQuillon({"export", "-P", DataPath("mixed/project.json")}).status, 2);
  EXPECT_EQ(RunQuillon({"order", "--to", "make", "-P", DataPath("mixed/project.json")}).status, 2);
  EXPECT_EQ(RunQuillon({"export", "--to", "cmake", "-P", DataPath("mixed/project.json")}).status, 2);

  ScopedTextFile netlist("MODULE blk 1\n", "block.hrf");
  ScopedTextFile vhdl(
      "entity user is end entity;\narchitecture rtl of user is\nbegin\n  b : entity work.blk;\nend "
      "architecture;\n",
      "user.vhd");
  CliResult result = RunQuillon({"export", "--to", "tcl", netlist.path(), vhdl.path()});
  EXPECT_EQ(result.status, 0) << result.err;
  EXPECT_NE(result.err.find(netlist.path() + " is left out of the export"), std::string::npos) << result.err;
  EXPECT_EQ(result.out.find("block.hrf"), std::string::npos);
  EXPECT_NE(result.out.find("  {work " + vhdl.path() + " vhdl}\n"), std::string::npos) << result.out;
}

TEST(Export, OrderJsonCarriesIncludeDirectoriesAndMacros) {
  CliResult result = RunQuillon(CliRun{
      {"--format", "json", "order", "-f", "gated.f", "-D", "A=1", "-I", "include"}, DataPath("verilog"), {}});
  ASSERT_EQ(result.status, 0) << result.err;
  Json answer = Json::parse(result.out);
  EXPECT_EQ(answer["includeDirs"], (Json{DataPath("verilog/include"), DataPath("verilog/include")}));
  EXPECT_EQ(answer["defines"], (Json{"FROM_COMMAND_LINE", "A=1"}));
}

}  // namespace
}  // namespace cli_test
