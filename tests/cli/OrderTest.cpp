// The order and check commands end to end.
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "CliRun.h"

namespace cli_test {
namespace {

using Json = nlohmann::json;

Json JsonAnswer(const CliResult& result) {
  Json answer = Json::parse(result.out, nullptr, false);
  EXPECT_FALSE(answer.is_discarded()) << result.out << result.err;
  return answer;
}

std::vector<std::string> OrderedPaths(const Json& answer) {
  std::vector<std::string> paths;
  for (const Json& entry : answer["order"]) paths.push_back(entry["path"]);
  return paths;
}

std::vector<std::string> Mixed(std::initializer_list<const char*> names) {
  std::vector<std::string> paths;
  for (const char* name : names) paths.push_back(DataPath(std::string("mixed/") + name));
  return paths;
}

TEST(Order, WholeProjectPutsEveryFileAfterTheFilesItUses) {
  CliResult result = RunQuillon({"--format", "json", "order", "-P", DataPath("mixed/project.json")});
  EXPECT_EQ(result.status, 0) << result.err;
  Json answer = JsonAnswer(result);
  EXPECT_EQ(OrderedPaths(answer), Mixed({"shared_pkg.vhd", "lane.vhd", "core.vhd", "top.vhd"}));
  EXPECT_EQ(answer["order"][0], (Json{{"path", DataPath("mixed/shared_pkg.vhd")},
                                      {"fullPath", DataPath("mixed/shared_pkg.vhd")},
                                      {"library", "shared"},
                                      {"plugin", "PLUGIN_Vhdl"}}));
  EXPECT_EQ(answer["messages"], Json::array());
}

TEST(Order, TextIsOnePathALineWithTheLibraryWhenAsked) {
  CliResult plain = RunQuillon({"order", "-P", DataPath("mixed/project.json")});
  EXPECT_EQ(Lines(plain.out), Mixed({"shared_pkg.vhd", "lane.vhd", "core.vhd", "top.vhd"}));
  CliResult withLibrary = RunQuillon({"order", "--with-library", "-P", DataPath("mixed/project.json")});
  EXPECT_EQ(Lines(withLibrary.out),
            (std::vector<std::string>{
                "shared " + DataPath("mixed/shared_pkg.vhd"), "work " + DataPath("mixed/lane.vhd"),
                "work " + DataPath("mixed/core.vhd"), "work " + DataPath("mixed/top.vhd")}));
}

TEST(Order, TopUnitLeavesOutTheFilesItDoesNotNeed) {
  CliResult result = RunQuillon({"order", "--top", "core", "-P", DataPath("mixed/project.json")});
  EXPECT_EQ(result.status, 0) << result.err;
  EXPECT_EQ(Lines(result.out), Mixed({"shared_pkg.vhd", "lane.vhd", "core.vhd"}));
}

TEST(Order, UnitOfAKindWithoutAnOrderOfItsOwnFails) {
  CliResult result =
      RunQuillon({"--format", "json", "order", "--unit", "shared_pkg", "-P", DataPath("mixed/project.json")});
  EXPECT_EQ(result.status, 1);
  Json answer = JsonAnswer(result);
  EXPECT_TRUE(answer["order"].is_null());
  ASSERT_EQ(answer["messages"].size(), 1u);
  EXPECT_EQ(answer["messages"][0]["severity"], "error");
  EXPECT_NE(answer["messages"][0]["text"].get<std::string>().find("entities, architectures and modules only"),
            std::string::npos);
}

TEST(Order, CircularFilesAreReportedAndStillOrdered) {
  const std::vector<std::string> sources{DataPath("cycle/ping.vhd"), DataPath("cycle/pong.vhd")};
  std::vector<std::string> args{"-q", "--format", "json", "order"};
  args.insert(args.end(), sources.begin(), sources.end());
  CliResult result = RunQuillon(args);
  EXPECT_EQ(result.status, 0) << result.err;
  EXPECT_EQ(result.err, "");  // -q keeps the warnings off standard error, not out of the answer
  Json answer = JsonAnswer(result);
  EXPECT_EQ(answer["order"].size(), 2u);
  bool cycleReported = false;
  for (const Json& message : answer["messages"]) {
    EXPECT_EQ(message["severity"], "warning");
    cycleReported = cycleReported ||
                    message["text"] == "File circular dependency detected using rule: define-before-use.";
  }
  EXPECT_TRUE(cycleReported) << answer["messages"].dump(2);

  args = {"-q", "--format", "dot", "order"};
  args.insert(args.end(), sources.begin(), sources.end());
  CliResult dot = RunQuillon(args);
  EXPECT_EQ(dot.status, 0) << dot.err;
  EXPECT_NE(dot.out.find("f0 -> f1 [color=red, style=bold];"), std::string::npos) << dot.out;
  EXPECT_NE(dot.out.find("f1 -> f0 [color=red, style=bold];"), std::string::npos) << dot.out;
}

TEST(Order, DotGraphMarksNoEdgeOfAnAcyclicProject) {
  CliResult result = RunQuillon({"--format", "dot", "order", "-P", DataPath("mixed/project.json")});
  EXPECT_EQ(result.status, 0) << result.err;
  EXPECT_NE(result.out.find(
                "subgraph \"cluster_shared\" {\n    label=\"shared\";\n    f0 [label=\"1. shared_pkg.vhd\", "
                "tooltip=\"" +
                DataPath("mixed/shared_pkg.vhd") + "\"];\n  }\n"),
            std::string::npos)
      << result.out;
  EXPECT_NE(result.out.find("f3 -> f2;"), std::string::npos) << result.out;  // top uses core
  EXPECT_EQ(result.out.find("color=red"), std::string::npos);
}

TEST(Check, SummarisesFilesUnitsAndMessages) {
  CliResult clean = RunQuillon({"check", "-P", DataPath("mixed/project.json")});
  EXPECT_EQ(clean.status, 0) << clean.err;
  // readme.notes, of no HDL plug-in's extension, is the one warning (not-hdl).
  EXPECT_EQ(clean.out, "5 files, 8 design units: 0 errors, 1 warning\n");

  CliResult cyclic =
      RunQuillon({"-q", "--format", "json", "check", DataPath("cycle/ping.vhd"), DataPath("cycle/pong.vhd")});
  EXPECT_EQ(cyclic.status, 0) << cyclic.err;
  Json answer = JsonAnswer(cyclic);
  EXPECT_EQ(answer["files"], 2);
  EXPECT_EQ(answer["units"], 4);
  EXPECT_FALSE(answer["messages"].empty());
}

}  // namespace
}  // namespace cli_test
