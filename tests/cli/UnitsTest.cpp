// The units command end to end: sources from the command line, project files and file lists, what
// reaches the parsers (targets, macros, include directories), and the JSON and text answers.
#include <gtest/gtest.h>

#include <algorithm>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "CliRun.h"

namespace cli_test {
namespace {

TEST(Units, AnswersGiveEveryRecordOfEveryFile) {
  const std::string mixed = DataPath("mixed");
  ExpectOutputsMatch({
      {"units-mixed.json", {"--format", "json", "units", "-P", mixed + "/project.json"}},
      // The list names no library: everything goes to work.
      {"units-mixed-list.json", {"--format", "json", "units", "-f", "sources.f"}, 0, mixed},
      // One unit named after a file of an unknown extension.
      {"units-readme.json", {"--format", "json", "units", mixed + "/readme.notes"}},
      // Library and plug-in apply to the sources after them.
      {"units-library-plugin.json",
       {"--format", "json", "units", mixed + "/top.vhd", "-l", "first", mixed + "/core.vhd", "--plugin",
        "PLUGIN_General", mixed + "/lane.vhd"}},
      // VHDL units list the store keys of their use clauses.
      {"units-uses.json", {"--format", "json", "units", DataPath("uses/e.vhd")}},
      {"units-top.txt", {"units", mixed + "/top.vhd"}},  // one line per unit in line order
  });
}

// The text listing is written file by file while the JSON one reads every file first: both name
// the same units of the same files, the text one in line order.
TEST(Units, TextListingNamesWhatTheJsonListingHolds) {
  const std::string project = DataPath("mixed/project.json");
  CliResult text = RunQuillon({"units", "-P", project});
  CliResult json = RunQuillon({"--format", "json", "units", "-P", project});
  ASSERT_EQ(text.status, 0) << text.err;
  ASSERT_EQ(json.status, 0) << json.err;
  const nlohmann::json listing = nlohmann::json::parse(json.out);
  std::string expected;
  for (const auto& file : listing["files"]) {
    std::vector<nlohmann::json> units(file["units"].begin(), file["units"].end());
    std::stable_sort(units.begin(), units.end(),
                     [](const auto& a, const auto& b) { return a["line"] < b["line"]; });
    for (const auto& unit : units) {
      const std::string key = unit["key"];
      const std::string shown = key.find('|') == std::string::npos ? unit["name"].get<std::string>() : key;
      expected += file["path"].get<std::string>() + ":" + std::to_string(unit["line"].get<int>()) + ": " +
                  unit["type"].get<std::string>() + " " + shown + " (library " +
                  file["library"].get<std::string>() + ")\n";
    }
  }
  EXPECT_GT(expected.size(), 0u);
  EXPECT_EQ(text.out, expected);
}

// The design-unit keys of every file, in file order.
std::vector<std::string> UnitKeys(std::vector<std::string> args, const std::string& workDir = {},
                                  int status = 0) {
  args.insert(args.begin(), {"--format", "json", "units"});
  CliResult result = RunQuillon(CliRun{args, workDir, {}});
  EXPECT_EQ(result.status, status) << result.err;
  std::vector<std::string> keys;
  const nlohmann::json answer = nlohmann::json::parse(result.out);
  for (const auto& file : answer["files"])
    for (const auto& unit : file["units"]) keys.push_back(unit["key"]);
  return keys;
}

TEST(Units, ParseTargetReachesTheParserFromEveryPlaceThatSetsIt) {
  const std::string source = DataPath("mixed/pragmas.vhd");
  const std::vector<std::string> both{"Entity|always_there", "Entity|model_only"};
  const std::vector<std::string> synthesisOnly{"Entity|always_there"};
  EXPECT_EQ(UnitKeys({source}), both);
  EXPECT_EQ(UnitKeys({"--target", "synthesis", source}), synthesisOnly);
  EXPECT_EQ(UnitKeys({"--property", "PROP_Parse_Target=synthesis", source}), synthesisOnly);
  ScopedTextFile project(
      R"({"properties": {"PROP_Parse_Target": "synthesis"}, "files": [{"path": ")" + source + R"("}]})",
      "project.json");
  EXPECT_EQ(UnitKeys({"-P", project.path()}), synthesisOnly);
  // The command line has the last word.
  EXPECT_EQ(UnitKeys({"-P", project.path(), "--target", "simulation"}), both);
}

TEST(Units, VerilogFilesAreCompiledInTheOrderGivenWithMacrosAndIncludeDirectories) {
  const std::string first = DataPath("verilog/first.v"), second = DataPath("verilog/second.v");
  // first.v defines the macro that second.v tests.
  EXPECT_EQ(UnitKeys({first, second}), (std::vector<std::string>{"Module|first", "Module|second"}));
  EXPECT_EQ(UnitKeys({second, first}), (std::vector<std::string>{"Module|first"}));

  // A missing include file is an error of the compiler; a file's units come in store-key order.
  const std::string gated = DataPath("verilog/gated.v"), include = DataPath("verilog/include");
  const std::vector<std::string> both{"Module|from_command_line", "Module|from_include"};
  EXPECT_EQ(UnitKeys({gated}, {}, 1), std::vector<std::string>{});
  EXPECT_EQ(UnitKeys({"-D", "FROM_COMMAND_LINE", gated}, {}, 1), std::vector<std::string>{both[0]});
  EXPECT_EQ(UnitKeys({"-I", include, gated}), std::vector<std::string>{both[1]});
  EXPECT_EQ(UnitKeys({"-D", "FROM_COMMAND_LINE", "-I", include, gated}), both);
  EXPECT_EQ(UnitKeys({"-f", "gated.f"}, DataPath("verilog")), both);
}

TEST(Units, OutputFileTakesTheAnswerInsteadOfStandardOutput) {
  ScopedTextFile placeholder("old contents", "answer.json");
  CliResult result =
      RunQuillon({"--format", "json", "-o", placeholder.path(), "units", DataPath("mixed/top.vhd")});
  EXPECT_EQ(result.status, 0) << result.err;
  EXPECT_EQ(result.out, "");
  EXPECT_EQ(ReadText(placeholder.path()),
            RunQuillon({"--format", "json", "units", DataPath("mixed/top.vhd")}).out);
}

TEST(Units, VerboseAddsTheDeveloperTexts) {
  const std::vector<std::string> args{"--plugin", "PLUGIN_Unheard", "units", DataPath("mixed/top.vhd")};
  const std::string text = "Parser PLUGIN_Unheard not found. Using PLUGIN_General";
  CliResult plain = RunQuillon(CliRun{args, {}, {{"QUILLON_DEBUG", ""}}});
  EXPECT_EQ(plain.status, 0) << plain.err;
  EXPECT_EQ(plain.err.find(text), std::string::npos) << plain.err;
  CliResult shown =
      RunQuillon(CliRun{{"--verbose", args[0], args[1], args[2], args[3]}, {}, {{"QUILLON_DEBUG", ""}}});
  EXPECT_EQ(shown.status, 0) << shown.err;
  EXPECT_NE(shown.err.find(text), std::string::npos) << shown.err;
}

}  // namespace
}  // namespace cli_test
