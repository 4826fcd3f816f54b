// The units command end to end: sources from the command line, project files and file lists,
// and the JSON and text answers.
#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <iterator>
#include <map>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "CliRun.h"

namespace cli_test {
namespace {

using Json = nlohmann::json;

Json ParsedJson(const std::string& text) {
  Json document = Json::parse(text, nullptr, false);
  EXPECT_FALSE(document.is_discarded()) << text;
  return document;
}

Json UnitsOf(const std::vector<std::string>& args, const std::string& workDir = {}) {
  std::vector<std::string> all{"--format", "json", "units"};
  all.insert(all.end(), args.begin(), args.end());
  CliResult result = RunQuillon(CliRun{all, workDir, {}});
  EXPECT_EQ(result.status, 0) << result.err;
  return ParsedJson(result.out);
}

std::string ExpectedText(const std::string& name) {
  std::ifstream in(DataPath(name), std::ios::binary);
  std::string text((std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
  for (std::size_t at = text.find("@DATA@"); at != std::string::npos; at = text.find("@DATA@", at)) {
    text.replace(at, 6, DataDir());
  }
  return text;
}

const Json* FileNamed(const Json& units, const std::string& path) {
  for (const Json& file : units["files"]) {
    if (file["fullPath"] == path) return &file;
  }
  return nullptr;
}

std::vector<std::string> KeysOf(const Json& file) {
  std::vector<std::string> keys;
  for (const Json& unit : file["units"]) keys.push_back(unit["storeKey"]);
  return keys;
}

TEST(Units, ProjectFileGivesEveryRecordOfEveryFile) {
  Json units = UnitsOf({"-P", DataPath("mixed/project.json")});
  EXPECT_EQ(units, ParsedJson(ExpectedText("mixed/expected/units.json")));
}

// The text listing is written file by file while the JSON one reads every file first: both name
// the same units of the same files, the text one in line order.
TEST(Units, TextListingNamesWhatTheJsonListingHolds) {
  const std::vector<std::string> sources{"-P", DataPath("mixed/project.json")};
  std::vector<std::string> textArgs{"units"};
  textArgs.insert(textArgs.end(), sources.begin(), sources.end());
  CliResult text = RunQuillon(CliRun{textArgs, {}, {}});
  ASSERT_EQ(text.status, 0) << text.err;

  const Json listing = UnitsOf(sources);
  std::string expected;
  for (const Json& file : listing["files"]) {
    std::vector<Json> units(file["units"].begin(), file["units"].end());
    std::stable_sort(units.begin(), units.end(),
                     [](const Json& a, const Json& b) { return a["line"] < b["line"]; });
    for (const Json& unit : units) {
      std::string key = unit["key"];
      std::string shown = key.find('|') == std::string::npos ? unit["name"].get<std::string>() : key;
      expected += file["path"].get<std::string>() + ":" + std::to_string(unit["line"].get<int>()) + ": " +
                  unit["type"].get<std::string>() + " " + shown + " (library " +
                  file["library"].get<std::string>() + ")\n";
    }
  }
  EXPECT_GT(expected.size(), 0u);
  EXPECT_EQ(text.out, expected);
}

TEST(Units, SourceWithAnUnknownExtensionIsOneUnitNamedAfterTheFile) {
  Json units = UnitsOf({DataPath("mixed/readme.notes")});
  ASSERT_EQ(units["files"].size(), 1u);
  const Json& file = units["files"][0];
  EXPECT_EQ(file["plugin"], "PLUGIN_General");
  ASSERT_EQ(file["units"].size(), 1u);
  EXPECT_EQ(file["units"][0]["type"], "Generic");
  EXPECT_EQ(file["units"][0]["name"], "readme.notes");
  EXPECT_EQ(file["units"][0]["key"], "Generic|readme.notes");
}

TEST(Units, FileListReadsTheSameFilesAsTheProjectFile) {
  Json fromList = UnitsOf({"-f", DataPath("mixed/sources.f")}, DataPath("mixed"));
  Json fromProject = UnitsOf({"-P", DataPath("mixed/project.json")});
  ASSERT_EQ(fromList["files"].size(), fromProject["files"].size());
  for (std::size_t i = 0; i < fromList["files"].size(); ++i) {
    EXPECT_EQ(fromList["files"][i]["fullPath"], fromProject["files"][i]["path"]);
    EXPECT_EQ(KeysOf(fromList["files"][i]), KeysOf(fromProject["files"][i]));
  }
  // The list names no library: everything goes to work.
  EXPECT_EQ((*FileNamed(fromList, DataPath("mixed/shared_pkg.vhd")))["library"], "work");
  EXPECT_EQ((*FileNamed(fromProject, DataPath("mixed/shared_pkg.vhd")))["library"], "shared");
}

TEST(Units, LibraryAndPluginApplyToTheSourcesAfterThem) {
  Json units = UnitsOf({DataPath("mixed/top.vhd"), "-l", "first", DataPath("mixed/core.vhd"), "--plugin",
                        "PLUGIN_General", DataPath("mixed/lane.vhd")});
  const Json* top = FileNamed(units, DataPath("mixed/top.vhd"));
  const Json* core = FileNamed(units, DataPath("mixed/core.vhd"));
  const Json* lane = FileNamed(units, DataPath("mixed/lane.vhd"));
  ASSERT_TRUE(top && core && lane);
  EXPECT_EQ((*top)["library"], "work");
  EXPECT_EQ((*top)["plugin"], "PLUGIN_Vhdl");
  EXPECT_EQ((*core)["library"], "first");
  EXPECT_EQ((*core)["plugin"], "PLUGIN_Vhdl");
  EXPECT_EQ((*lane)["library"], "first");
  EXPECT_EQ((*lane)["plugin"], "PLUGIN_General");
  EXPECT_EQ(KeysOf(*lane), std::vector<std::string>{"|Generic||lane.vhd"});
}

TEST(Units, ParseTargetReachesTheParserFromEveryPlaceThatSetsIt) {
  const std::string source = DataPath("mixed/pragmas.vhd");
  const std::vector<std::string> both{"|Entity||always_there", "|Entity||model_only"};
  const std::vector<std::string> synthesisOnly{"|Entity||always_there"};
  EXPECT_EQ(KeysOf(UnitsOf({source})["files"][0]), both);
  EXPECT_EQ(KeysOf(UnitsOf({"--target", "synthesis", source})["files"][0]), synthesisOnly);
  EXPECT_EQ(KeysOf(UnitsOf({"--property", "PROP_Parse_Target=synthesis", source})["files"][0]),
            synthesisOnly);

  ScopedTextFile project(
      R"({"properties": {"PROP_Parse_Target": "synthesis"}, "files": [{"path": ")" + source + R"("}]})",
      "project.json");
  EXPECT_EQ(KeysOf(UnitsOf({"-P", project.path()})["files"][0]), synthesisOnly);
  // The command line has the last word.
  EXPECT_EQ(KeysOf(UnitsOf({"-P", project.path(), "--target", "simulation"})["files"][0]), both);
}

TEST(Units, TextOutputIsOneLinePerUnitInLineOrder) {
  CliResult result = RunQuillon({"units", DataPath("mixed/top.vhd")});
  EXPECT_EQ(result.status, 0) << result.err;
  const std::string path = DataPath("mixed/top.vhd");
  EXPECT_EQ(Lines(result.out), (std::vector<std::string>{
                                   path + ":1: Library ieee (library work)",
                                   path + ":2: Use ieee.std_logic_1164.all (library work)",
                                   path + ":5: Entity Entity|top (library work)",
                                   path + ":8: Architecture Architecture|top|rtl (library work)",
                                   path + ":11: EntityInstantiation u_core (library work)",
                               }));
}

TEST(Units, OutputFileTakesTheAnswerInsteadOfStandardOutput) {
  ScopedTextFile placeholder("old contents", "answer.json");
  CliResult result =
      RunQuillon({"--format", "json", "-o", placeholder.path(), "units", DataPath("mixed/top.vhd")});
  EXPECT_EQ(result.status, 0) << result.err;
  EXPECT_EQ(result.out, "");
  std::ifstream in(placeholder.path());
  std::string written((std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
  EXPECT_EQ(ParsedJson(written), UnitsOf({DataPath("mixed/top.vhd")}));
}

TEST(Units, VerboseAddsTheDeveloperTexts) {
  const std::vector<std::pair<std::string, std::string>> noDebugVariable{{"QUILLON_DEBUG", ""}};
  const std::vector<std::string> args{"--plugin", "PLUGIN_Unheard", "units", DataPath("mixed/top.vhd")};
  std::vector<std::string> verbose{"--verbose"};
  verbose.insert(verbose.end(), args.begin(), args.end());
  const std::string text = "Parser PLUGIN_Unheard not found. Using PLUGIN_General";

  CliResult plain = RunQuillon(CliRun{args, {}, noDebugVariable});
  EXPECT_EQ(plain.status, 0) << plain.err;
  EXPECT_EQ(plain.err.find(text), std::string::npos) << plain.err;
  CliResult shown = RunQuillon(CliRun{verbose, {}, noDebugVariable});
  EXPECT_EQ(shown.status, 0) << shown.err;
  EXPECT_NE(shown.err.find(text), std::string::npos) << shown.err;
}

TEST(Units, VhdlUnitsListTheStoreKeysOfTheirUseClauses) {
  ScopedTextFile source(
      "library ieee;\n"
      "use ieee.std_logic_1164.all;\n"
      "entity e is end;\n"
      "architecture a of e is\n"
      "  use work.p.all;\n"
      "begin\n"
      "end;\n",
      "e.vhd");
  Json units = UnitsOf({source.path()});
  ASSERT_EQ(units["files"].size(), 1u);
  std::map<std::string, Json> usesByType;
  for (const Json& unit : units["files"][0]["units"]) usesByType[unit["type"]] = unit.value("uses", Json());
  EXPECT_EQ(usesByType["Entity"], Json::array({"||Use|ieee|std_logic_1164|all|"}));
  EXPECT_EQ(usesByType["Architecture"], Json::array({"||Use|work|p|all|"}));
  EXPECT_TRUE(usesByType["Library"].is_null());
  EXPECT_TRUE(usesByType["Use"].is_null());
}

}  // namespace
}  // namespace cli_test
