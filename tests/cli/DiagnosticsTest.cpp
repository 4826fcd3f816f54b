// quillon's own diagnostics: each on a minimal broken project, and never on its corrected twin.
#include <gtest/gtest.h>

#include <cstdio>
#include <initializer_list>
#include <nlohmann/json.hpp>
#include <string>
#include <utility>
#include <vector>

#include "CliRun.h"
#include "ScopedTempDir.h"

namespace cli_test {
namespace {

using Json = nlohmann::json;

class Project {
 public:
  // Writes the file and returns its path.
  std::string Add(const std::string& name, const std::string& text) {
    std::string path = dir_.Path(name);
    std::FILE* out = std::fopen(path.c_str(), "wb");
    EXPECT_NE(out, nullptr) << path;
    if (out) {
      std::fwrite(text.data(), 1, text.size(), out);
      std::fclose(out);
    }
    paths_.push_back(path);
    return path;
  }
  const std::vector<std::string>& paths() const { return paths_; }

 private:
  ScopedTempDir dir_;
  std::vector<std::string> paths_;
};

struct Checked {
  int status = -1;
  Json diagnostics;
  std::string err;
  Json messages = {};
};

Checked RunJson(const std::string& command, const Project& project, std::vector<std::string> options = {}) {
  std::vector<std::string> args{"-q", "--format", "json", command};
  args.insert(args.end(), options.begin(), options.end());
  args.insert(args.end(), project.paths().begin(), project.paths().end());
  CliResult result = RunQuillon(args);
  Json answer = Json::parse(result.out, nullptr, false);
  EXPECT_FALSE(answer.is_discarded()) << result.out << result.err;
  if (answer.is_discarded()) return {result.status, Json(), result.err};
  return {result.status, answer.value("diagnostics", Json()), result.err, answer.value("messages", Json())};
}

// The corrected twin of a broken project: check passes without a single diagnostic.
void ExpectCleanCheck(const Project& project) {
  Checked checked = RunJson("check", project);
  EXPECT_EQ(checked.status, 0) << checked.diagnostics.dump(2);
  EXPECT_TRUE(checked.diagnostics.empty());
}

std::vector<std::string> CodesOf(const Json& diagnostics) {
  std::vector<std::string> codes;
  for (const Json& diagnostic : diagnostics) codes.push_back(diagnostic["code"]);
  return codes;
}

const std::string kSub = "entity sub is end;\narchitecture rtl of sub is begin end;\n";

TEST(Diagnostics, EntityInstanceMissingFromItsLibraryIsAnErrorWithFileAndLine) {
  Project broken;
  std::string top = broken.Add("top.vhd",
                               "entity top is end;\narchitecture rtl of top is\nbegin\n"
                               "  u1 : entity work.sub(rtl);\nend;\n");
  Checked checked = RunJson("check", broken);
  EXPECT_EQ(checked.status, 1);
  ASSERT_EQ(checked.diagnostics.size(), 1u) << checked.diagnostics.dump(2);
  EXPECT_EQ(checked.diagnostics[0], Json({{"severity", "error"},
                                          {"code", "unresolved-instance"},
                                          {"text", "instance 'u1': entity 'sub' is not in library 'work'"},
                                          {"file", top},
                                          {"fileFullPath", top},
                                          {"line", 4}}));

  Checked tree = RunJson("tree", broken);
  EXPECT_EQ(tree.status, 0);
  ASSERT_EQ(CodesOf(tree.diagnostics), std::vector<std::string>{"unresolved-instance"});
  EXPECT_EQ(tree.diagnostics[0]["severity"], "warning");

  broken.Add("sub.vhd", kSub);
  ExpectCleanCheck(broken);
}

TEST(Diagnostics, UseClauseOfAPackageMissingFromTheLibraryIsAnError) {
  Project broken;
  broken.Add("user.vhd", "use work.types_pkg.all;\nentity user is end;\n");
  Checked checked = RunJson("check", broken);
  EXPECT_EQ(checked.status, 1);
  EXPECT_EQ(CodesOf(checked.diagnostics), std::vector<std::string>{"unresolved-package"});
  EXPECT_EQ(checked.diagnostics[0]["line"], 1);

  broken.Add("types.vhd", "package types_pkg is end;\n");
  ExpectCleanCheck(broken);
}

TEST(Diagnostics, LibraryTheProjectDoesNotHaveIsAnErrorUnlessExternal) {
  Project broken;
  broken.Add("user.vhd", "library common;\nuse common.pkg.all;\nentity user is end;\n");
  Checked checked = RunJson("check", broken);
  EXPECT_EQ(checked.status, 1);
  EXPECT_EQ(CodesOf(checked.diagnostics), std::vector<std::string>{"unknown-library"})
      << "reported once a file";
  EXPECT_EQ(checked.diagnostics[0]["line"], 1);

  Checked external = RunJson("check", broken, {"--external-library", "Common"});
  EXPECT_EQ(external.status, 0) << external.diagnostics.dump(2);
  EXPECT_TRUE(external.diagnostics.empty());

  Json project = {{"externalLibraries", {"common"}}, {"files", {{{"path", broken.paths()[0]}}}}};
  ScopedTextFile projectFile(project.dump(), "project.json");
  CliResult fromFile = RunQuillon({"-q", "check", "-P", projectFile.path()});
  EXPECT_EQ(fromFile.status, 0) << fromFile.out << fromFile.err;
}

TEST(Diagnostics, TwoUnitsOfOneNameInOneLibraryAreAnErrorNamingBothPlaces) {
  Project broken;
  std::string first = broken.Add("a.vhd", "entity dup is end;\n");
  std::string second = broken.Add("b.vhd", "\nentity DUP is end;\n");
  Checked checked = RunJson("check", broken);
  EXPECT_EQ(checked.status, 1);
  ASSERT_EQ(CodesOf(checked.diagnostics), std::vector<std::string>{"duplicate-unit"});
  EXPECT_EQ(checked.diagnostics[0]["file"], second);
  EXPECT_EQ(checked.diagnostics[0]["line"], 2);
  std::string message = checked.diagnostics[0]["text"];
  EXPECT_NE(message.find(first + ":1"), std::string::npos) << message;
  EXPECT_NE(message.find(second + ":2"), std::string::npos) << message;

  Project twin;
  twin.Add("a.vhd", "entity dup is end;\n");
  twin.Add("b.vhd", "entity other is end;\n");
  EXPECT_EQ(RunJson("check", twin).status, 0);
}

TEST(Diagnostics, PackagesThatUseEachOtherLeaveNoValidOrder) {
  Project broken;
  broken.Add("a.vhd", "use work.pkg_b.all;\npackage pkg_a is end;\n");
  broken.Add("b.vhd", "use work.pkg_a.all;\npackage pkg_b is end;\n");
  Checked checked = RunJson("check", broken);
  EXPECT_EQ(checked.status, 1);
  EXPECT_EQ(CodesOf(checked.diagnostics), std::vector<std::string>{"no-valid-order"});
  EXPECT_TRUE(checked.diagnostics[0]["line"].is_null());

  // The cut order is still delivered, with the same finding as a warning, but it is no success.
  Checked order = RunJson("order", broken);
  EXPECT_EQ(order.status, 1);
  ASSERT_EQ(CodesOf(order.diagnostics), std::vector<std::string>{"no-valid-order"});
  EXPECT_EQ(order.diagnostics[0]["severity"], "warning");

  Project twin;
  twin.Add("a.vhd", "use work.pkg_b.all;\npackage pkg_a is end;\n");
  twin.Add("b.vhd", "package pkg_b is end;\n");
  EXPECT_EQ(RunJson("check", twin).status, 0);
}

TEST(Diagnostics, ACycleListingIsPrintedOnceWithoutEmptyLines) {
  Project cyclic;
  std::string a = cyclic.Add("a.vhd", "use work.pkg_b.all;\npackage pkg_a is end;\n");
  std::string b = cyclic.Add("b.vhd", "use work.pkg_a.all;\npackage pkg_b is end;\n");
  CliResult result = RunQuillon({"order", a, b});
  EXPECT_EQ(result.status, 1);
  std::vector<std::string> lines = Lines(result.err);
  auto count = [&](const std::string& wanted) {
    std::size_t n = 0;
    for (const std::string& line : lines) n += line == wanted;
    return n;
  };
  EXPECT_EQ(count("WARNING: Found circular dependency consisting of the following files:"), 1u) << result.err;
  EXPECT_EQ(count("WARNING:           " + a), 1u) << result.err;
  EXPECT_EQ(count("WARNING: "), 0u) << result.err;
  EXPECT_EQ(count("WARNING: Breaking file dependency loop(s) to create a compile order."), 1u) << result.err;

  // The JSON answer drops the repeated listing as well.
  CliResult json = RunQuillon({"-q", "--format", "json", "order", a, b});
  Json answer = Json::parse(json.out, nullptr, false);
  std::size_t listings = 0;
  for (const Json& message : answer["messages"])
    listings += message["text"] == "Found circular dependency consisting of the following files:";
  EXPECT_EQ(listings, 1u);
}

TEST(Diagnostics, SourceInWhichNothingWasFoundIsAnError) {
  Project broken;
  std::string notes = broken.Add("notes.vhd", "These are my notes, not VHDL.\n");
  Checked checked = RunJson("check", broken);
  EXPECT_EQ(checked.status, 1);
  ASSERT_EQ(CodesOf(checked.diagnostics), std::vector<std::string>{"empty-source"});
  EXPECT_EQ(checked.diagnostics[0]["file"], notes);

  Project twin;
  twin.Add("notes.vhd", "-- notes\nentity noted is end;\n");
  EXPECT_EQ(RunJson("check", twin).status, 0);
}

TEST(Diagnostics, SyntaxErrorsOfVhdlAndVerilogAreErrorsWithFileAndLineInsteadOfMessages) {
  Project broken;
  std::string vhdl = broken.Add("e.vhd", "entity e is port (a : in bit;\nend;\n");
  std::string verilog = broken.Add("m.v", "module m;\n  wire w\n  e u1 ();\nendmodule\n");
  Checked checked = RunJson("check", broken);
  EXPECT_EQ(checked.status, 1);
  ASSERT_EQ(CodesOf(checked.diagnostics), (std::vector<std::string>{"syntax-error", "syntax-error"}))
      << checked.diagnostics.dump(2);
  EXPECT_EQ(checked.diagnostics[0]["file"], vhdl);
  EXPECT_EQ(checked.diagnostics[0]["line"], 2);
  EXPECT_EQ(checked.diagnostics[0]["text"], "'(' of line 1 is not closed by ')'");
  EXPECT_EQ(checked.diagnostics[1]["file"], verilog);
  EXPECT_EQ(checked.diagnostics[1]["line"], 2);
  EXPECT_EQ(checked.diagnostics[1]["text"], "';' expected after \"w\"");
  EXPECT_TRUE(checked.messages.empty()) << checked.messages.dump(2);

  std::vector<std::string> args{"check"};
  args.insert(args.end(), broken.paths().begin(), broken.paths().end());
  CliResult text = RunQuillon(args);
  EXPECT_EQ(text.status, 1);
  EXPECT_NE(text.err.find(verilog + ":2: error: ';' expected after \"w\" [syntax-error]\n"),
            std::string::npos)
      << text.err;
  EXPECT_EQ(text.err.find("ERROR:"), std::string::npos) << "reported once, as a diagnostic: " << text.err;
  EXPECT_EQ(text.out, "2 files, 2 design units: 2 errors, 0 warnings\n");

  // Other commands still give their answer, with the parsers' messages.
  Checked units = RunJson("units", broken);
  EXPECT_EQ(units.status, 1);
  EXPECT_EQ(units.messages.size(), 2u) << units.messages.dump(2);

  Project twin;
  twin.Add("e.vhd", "entity e is port (a : in bit);\nend;\n");
  twin.Add("m.v", "module m;\n  wire w;\n  e u1 ();\nendmodule\n");
  ExpectCleanCheck(twin);
}

TEST(Diagnostics, SourceOfAnExtensionThatNamesNoPluginIsNotHdlAndAnErrorWhenStrict) {
  Project broken;
  broken.Add("top.vhd", "entity top is end;\n");
  std::string notes = broken.Add("notes.txt", "remember the clock\n");
  Checked checked = RunJson("check", broken);
  EXPECT_EQ(checked.status, 0);
  ASSERT_EQ(CodesOf(checked.diagnostics), std::vector<std::string>{"not-hdl"});
  EXPECT_EQ(checked.diagnostics[0]["severity"], "warning");
  EXPECT_EQ(checked.diagnostics[0]["file"], notes);
  EXPECT_EQ(RunJson("check", broken, {"--strict"}).status, 1);

  // The general plug-in chosen on purpose is no mistake.
  std::vector<std::string> args{"-q",       "--format",       "json", "check", broken.paths()[0],
                                "--plugin", "PLUGIN_General", notes};
  CliResult chosen = RunQuillon(args);
  EXPECT_EQ(chosen.status, 0) << chosen.out << chosen.err;
  EXPECT_TRUE(Json::parse(chosen.out, nullptr, false).value("diagnostics", Json()).empty()) << chosen.out;
}

TEST(Diagnostics, ComponentWithoutAnEntityIsABlackBoxWarningAndAnErrorWhenStrict) {
  Project broken;
  broken.Add("top.vhd",
             "entity top is end;\narchitecture rtl of top is\n  component core end component;\nbegin\n"
             "  u : core;\nend;\n");
  Checked checked = RunJson("check", broken);
  EXPECT_EQ(checked.status, 0);
  ASSERT_EQ(CodesOf(checked.diagnostics), std::vector<std::string>{"black-box"});
  EXPECT_EQ(checked.diagnostics[0]["severity"], "warning");
  EXPECT_EQ(checked.diagnostics[0]["line"], 5);
  EXPECT_EQ(RunJson("check", broken, {"--strict"}).status, 1);
  EXPECT_EQ(RunJson("check", broken, {"--warnings-as-errors"}).status, 1);

  broken.Add("core.vhd", "entity core is end;\n");
  broken.Add("cells.vhd",
             "library basecell;\nuse basecell.vcomponents.all;\nentity tie is end;\n"
             "architecture rtl of tie is\nbegin\n  u : QL_TIEHI port map (o => x);\nend;\n");
  Checked twin = RunJson("check", broken, {"--strict", "--warnings-as-errors"});
  EXPECT_EQ(twin.status, 0) << twin.diagnostics.dump(2);
  EXPECT_TRUE(twin.diagnostics.empty());
}

TEST(Diagnostics, TextOutputNamesFileLineSeverityAndCode) {
  Project broken;
  std::string user = broken.Add("user.vhd", "use work.types_pkg.all;\nentity user is end;\n");
  std::vector<std::string> args{"check", user};
  CliResult result = RunQuillon(args);
  EXPECT_EQ(result.status, 1);
  EXPECT_NE(result.err.find(user + ":1: error: package 'types_pkg' of a use clause is not in library 'work' "
                                   "[unresolved-package]\n"),
            std::string::npos)
      << result.err;
  EXPECT_EQ(result.out, "1 file, 1 design unit: 1 error, 0 warnings\n");

  CliResult order = RunQuillon({"order", user});
  EXPECT_EQ(order.status, 0);
  EXPECT_NE(order.err.find(user + ":1: warning: "), std::string::npos) << order.err;
}

}  // namespace
}  // namespace cli_test
