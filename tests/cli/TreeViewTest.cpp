// The parts of a hierarchy that tree shows when asked (--top, --depth, --instances), and the DOT
// drawings: one node per unit or file, a cluster per library.
#include <gtest/gtest.h>

#include <fstream>
#include <nlohmann/json.hpp>
#include <set>
#include <string>
#include <vector>

#include "CliRun.h"

namespace cli_test {
namespace {

using Json = nlohmann::json;

std::vector<std::string> TreeLines(std::vector<std::string> options) {
  std::vector<std::string> args{"tree", "-P", DataPath("mixed/project.json")};
  args.insert(args.end(), options.begin(), options.end());
  CliResult result = RunQuillon(args);
  EXPECT_EQ(result.status, 0) << result.err;
  return Lines(result.out);
}

std::size_t Count(const std::string& text, const std::string& part) {
  std::size_t count = 0;
  for (std::size_t at = text.find(part); at != std::string::npos; at = text.find(part, at + 1)) ++count;
  return count;
}

// The ids of the node statements ("ID [label=..."), each of them required to have a tooltip.
std::vector<std::string> NodeIds(const std::string& dot) {
  std::vector<std::string> ids;
  for (const std::string& line : Lines(dot)) {
    std::size_t attributes = line.find(" [label=");
    if (attributes == std::string::npos) continue;
    EXPECT_NE(line.find(", tooltip=\""), std::string::npos) << line;
    std::size_t start = line.find_first_not_of(' ');
    ids.push_back(line.substr(start, attributes - start));
  }
  return ids;
}

TEST(TreeView, TopShowsTheSubtreeOfOneUnitAndAnEntityStandsForItsArchitecture) {
  EXPECT_EQ(TreeLines({"--top", "core"}), (std::vector<std::string>{
                                              "u_core: core(rtl) [work:Architecture]  core.vhd",
                                              "  u_lane: lane(rtl) [work:Architecture]  lane.vhd",
                                              "    lane [work:Entity]  lane.vhd",
                                              "  core [work:Entity]  core.vhd",
                                              "    shared_pkg [shared:PackageDecl]  shared_pkg.vhd",
                                          }));
  EXPECT_EQ(TreeLines({"--top", "Architecture|lane|rtl"}),
            (std::vector<std::string>{"u_lane: lane(rtl) [work:Architecture]  lane.vhd",
                                      "  lane [work:Entity]  lane.vhd"}));

  CliResult json =
      RunQuillon({"-q", "--format", "json", "tree", "--top", "lane", "-P", DataPath("mixed/project.json")});
  ASSERT_EQ(json.status, 0) << json.err;
  Json answer = Json::parse(json.out, nullptr, false);
  ASSERT_EQ(answer["root"]["children"].size(), 1u) << json.out;
  EXPECT_EQ(answer["root"]["children"][0]["instance"], "u_lane");

  CliResult unknown = RunQuillon({"tree", "--top", "nothing", "-P", DataPath("mixed/project.json")});
  EXPECT_EQ(unknown.status, 2);
  EXPECT_EQ(unknown.out, "");
  EXPECT_NE(unknown.err.find("unknown design unit 'nothing'"), std::string::npos) << unknown.err;
}

// A package that two others use: below the second user alone, the package is no longer shared
// with anything shown, so it is printed in full there.
TEST(TreeView, SharedSubtreeFirstMetOutsideTheTopIsPrintedInFull) {
  ScopedTextFile source(
      "package base is\nend package;\n"
      "use work.base.all;\npackage common is\nend package;\n"
      "use work.common.all;\npackage user_a is\nend package;\n"
      "use work.common.all;\npackage user_b is\nend package;\n",
      "shared.vhd");
  CliResult result = RunQuillon({"tree", "--top", "user_b", source.path()});
  EXPECT_EQ(result.status, 0) << result.err;
  EXPECT_EQ(Lines(result.out), (std::vector<std::string>{
                                   "user_b [PackageDecl]  shared.vhd",
                                   "  common [work:PackageDecl]  shared.vhd",
                                   "    base [work:PackageDecl]  shared.vhd",
                               }));
}

TEST(TreeView, DepthCountsWhatItLeavesOutAndInstancesLeaveOutEntitiesAndPackages) {
  EXPECT_EQ(TreeLines({"--depth", "1"}), (std::vector<std::string>{
                                             "top(rtl) [Architecture]  top.vhd",
                                             "  u_core: core(rtl) [work:Architecture]  core.vhd",
                                             "    ... (4 more below)",
                                             "  top [work:Entity]  top.vhd",
                                         }));
  EXPECT_EQ(TreeLines({"--depth", "0"}),
            (std::vector<std::string>{"top(rtl) [Architecture]  top.vhd", "  ... (6 more below)"}));
  EXPECT_EQ(TreeLines({"--instances"}), (std::vector<std::string>{
                                            "top(rtl) [Architecture]  top.vhd",
                                            "  u_core: core(rtl) [work:Architecture]  core.vhd",
                                            "    u_lane: lane(rtl) [work:Architecture]  lane.vhd",
                                        }));
  EXPECT_EQ(TreeLines({"--instances", "--depth", "0", "--top", "top"}),
            (std::vector<std::string>{"top(rtl) [Architecture]  top.vhd", "  ... (2 more below)"}));

  CliResult json =
      RunQuillon({"-q", "--format", "json", "tree", "--depth", "1", "-P", DataPath("mixed/project.json")});
  ASSERT_EQ(json.status, 0) << json.err;
  Json answer = Json::parse(json.out, nullptr, false);
  const Json& core = answer["root"]["children"][0]["children"][0];
  EXPECT_EQ(core["instance"], "u_core");
  EXPECT_EQ(core["moreBelow"], 4);
  EXPECT_TRUE(core["children"].empty());
  EXPECT_FALSE(answer["root"]["children"][0].contains("moreBelow"));
}

// Two instances of one entity, whose package lies in a library of its own.
TEST(TreeView, DotDrawsEachUnitOnceInTheClusterOfItsLibrary) {
  ScopedTextFile package("package pkg is\nend package;\n", "pkg.vhd");
  std::string design = package.Beside("design.vhd");
  std::ofstream(design) << "library util;\nuse util.pkg.all;\nentity leaf is\nend entity;\n"
                           "architecture rtl of leaf is\nbegin\nend architecture;\n"
                           "entity top is\nend entity;\narchitecture rtl of top is\nbegin\n"
                           "  a : entity work.leaf;\n  b : entity work.leaf;\nend architecture;\n";
  CliResult result =
      RunQuillon({"-q", "--format", "dot", "tree", "-l", "util", package.path(), "-l", "work", design});
  ASSERT_EQ(result.status, 0) << result.err;
  const std::string& dot = result.out;
  EXPECT_NE(dot.find("  rankdir=LR;\n"), std::string::npos) << dot;
  EXPECT_EQ(Count(dot, "subgraph \"cluster_"), 2u) << dot;
  EXPECT_NE(dot.find("subgraph \"cluster_util\" {\n    label=\"util\";\n    n"), std::string::npos) << dot;
  EXPECT_EQ(Count(dot, "label=\"leaf(rtl)\""), 1u) << dot;
  EXPECT_EQ(Count(dot, "label=\"pkg\\nPackageDecl\", tooltip=\"" + package.path() + "\""), 1u) << dot;
  std::vector<std::string> ids = NodeIds(dot);
  EXPECT_EQ(ids.size(), 5u) << dot;  // top and leaf, each an architecture and an entity; pkg
  EXPECT_EQ(std::set<std::string>(ids.begin(), ids.end()).size(), ids.size()) << dot;
  EXPECT_EQ(Count(dot, " -> "), 4u) << dot;  // both instances of leaf are one edge
}

TEST(TreeView, DotQuotesLibraryNamesAndPaths) {
  ScopedTextFile source("package p is\nend package;\n", "odd \"name\".vhd");
  CliResult result = RunQuillon({"-q", "--format", "dot", "order", "-l", "x\"y\\z", source.path()});
  ASSERT_EQ(result.status, 0) << result.err;
  EXPECT_NE(result.out.find("subgraph \"cluster_x\\\"y\\\\z\" {"), std::string::npos) << result.out;
  EXPECT_NE(result.out.find("[label=\"1. odd \\\"name\\\".vhd\""), std::string::npos) << result.out;
}

}  // namespace
}  // namespace cli_test
