// The tree command end to end: the hierarchy that the module builds, in JSON, text and DOT.
#include <gtest/gtest.h>

#include <fstream>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "CliRun.h"

namespace cli_test {
namespace {

using Json = nlohmann::json;

Json TreeOf(const std::vector<std::string>& args) {
  std::vector<std::string> all{"-q", "--format", "json", "tree"};
  all.insert(all.end(), args.begin(), args.end());
  CliResult result = RunQuillon(all);
  EXPECT_EQ(result.status, 0) << result.err;
  Json answer = Json::parse(result.out, nullptr, false);
  EXPECT_FALSE(answer.is_discarded()) << result.out;
  return answer;
}

std::string BaseName(const Json& path) {
  if (!path.is_string()) return "-";
  std::string text = path;
  return text.substr(text.rfind('/') + 1);
}

std::string Text(const Json& value) { return value.is_string() ? value.get<std::string>() : "null"; }

// One line a node below the root: indent, name, instance, path, type, element type, file.
void Outline(const Json& node, int depth, std::vector<std::string>& lines) {
  lines.push_back(std::string(depth * 2, ' ') + Text(node["name"]) + " | " + Text(node["instance"]) + " | " +
                  Text(node["path"]) + " | " + Text(node["type"]) + " | " + Text(node["elementType"]) +
                  " | " + BaseName(node["file"]));
  for (const Json& child : node["children"]) Outline(child, depth + 1, lines);
}

std::vector<std::string> OutlineBelowRoot(const Json& root) {
  std::vector<std::string> lines;
  for (const Json& top : root["children"]) Outline(top, 0, lines);
  return lines;
}

const Json* ChildWithInstance(const Json& node, const std::string& label) {
  for (const Json& child : node["children"]) {
    if (child["instance"] == label) return &child;
  }
  return nullptr;
}

TEST(Hierarchy, JsonTreeGivesEveryNodeItsNamesPathAndFile) {
  Json answer = TreeOf({"-P", DataPath("mixed/project.json")});
  const Json& root = answer["root"];
  EXPECT_EQ(root["name"], "");
  EXPECT_TRUE(root["elementType"].is_null());
  EXPECT_TRUE(root["file"].is_null());
  EXPECT_EQ(
      OutlineBelowRoot(root),
      (std::vector<std::string>{
          "Architecture|top|rtl |  | /top | instance | Architecture | top.vhd",
          "  work:Architecture|core|rtl | u_core | /top/u_core | instance | Architecture | core.vhd",
          "    work:Architecture|lane|rtl | u_lane | /top/u_core/u_lane | instance | Architecture | lane.vhd",
          "      work:Entity|lane |  |  | work:Entity | Entity | lane.vhd",
          "    work:Entity|core |  |  | work:Entity | Entity | core.vhd",
          "      shared:PackageDecl|shared_pkg |  |  | shared:PackageDecl | PackageDecl | shared_pkg.vhd",
          "  work:Entity|top |  |  | work:Entity | Entity | top.vhd",
      }));
  const Json& core = *ChildWithInstance(root["children"][0], "u_core");
  EXPECT_EQ(core["kind"], "work:Architecture");
  EXPECT_EQ(core["unit"], "core");
  EXPECT_EQ(core["architecture"], "rtl");
  EXPECT_EQ(core["libraryCell"], false);
  EXPECT_EQ(core["partition"], "");
  EXPECT_EQ(core["file"], DataPath("mixed/core.vhd"));
  EXPECT_EQ(answer["messages"], Json::array());
}

TEST(Hierarchy, UnitMissingFromTheProjectHasNoElementAndNoFile) {
  Json answer = TreeOf({DataPath("stray/stray.vhd")});
  ASSERT_EQ(answer["root"]["children"].size(), 1u);
  const Json* mystery = ChildWithInstance(answer["root"]["children"][0], "u_mystery");
  ASSERT_NE(mystery, nullptr) << answer.dump(2);
  EXPECT_EQ((*mystery)["unit"], "mystery_block");
  EXPECT_TRUE((*mystery)["elementType"].is_null());
  EXPECT_TRUE((*mystery)["file"].is_null());
  EXPECT_EQ((*mystery)["libraryCell"], false);

  CliResult text = RunQuillon({"tree", DataPath("stray/stray.vhd")});
  EXPECT_NE(text.out.find("  u_mystery: mystery_block [work:Architecture] (not in the project)\n"),
            std::string::npos)
      << text.out;
}

TEST(Hierarchy, TextTreeIndentsEachLevelAndNamesFilesByBaseNameUnlessVerbose) {
  CliResult result = RunQuillon({"tree", "-P", DataPath("mixed/project.json")});
  EXPECT_EQ(result.status, 0) << result.err;
  EXPECT_EQ(Lines(result.out), (std::vector<std::string>{
                                   "top(rtl) [Architecture]  top.vhd",
                                   "  u_core: core(rtl) [work:Architecture]  core.vhd",
                                   "    u_lane: lane(rtl) [work:Architecture]  lane.vhd",
                                   "      lane [work:Entity]  lane.vhd",
                                   "    core [work:Entity]  core.vhd",
                                   "      shared_pkg [shared:PackageDecl]  shared_pkg.vhd",
                                   "  top [work:Entity]  top.vhd",
                               }));

  CliResult verbose = RunQuillon({"-v", "tree", "-P", DataPath("mixed/project.json")});
  EXPECT_EQ(verbose.status, 0) << verbose.err;
  EXPECT_EQ(Lines(verbose.out)[1], "  u_core: core(rtl) [work:Architecture]  " + DataPath("mixed/core.vhd"));
}

TEST(Hierarchy, CircularReferenceIsAWarningNotAFailure) {
  CliResult result =
      RunQuillon({"--format", "json", "tree", DataPath("cycle/ping.vhd"), DataPath("cycle/pong.vhd")});
  EXPECT_EQ(result.status, 0) << result.err;
  EXPECT_NE(result.err.find("WARNING: Circular Reference: "), std::string::npos) << result.err;
  Json answer = Json::parse(result.out, nullptr, false);
  ASSERT_FALSE(answer.is_discarded());
  ASSERT_FALSE(answer["messages"].empty());
  EXPECT_EQ(answer["messages"][0]["severity"], "warning");
  EXPECT_EQ(Text(answer["messages"][0]["text"]).rfind("Circular Reference: ", 0), 0u);
}

// A package that two others use; the second occurrence points at the first.
constexpr const char* kSharedPackages =
    "package base is\nend package;\n"
    "use work.base.all;\npackage common is\nend package;\n"
    "use work.common.all;\npackage user_a is\nend package;\n"
    "use work.common.all;\npackage user_b is\nend package;\n";

TEST(Hierarchy, SharedSubtreeIsPrintedOnceAndReferencedAfterwards) {
  ScopedTextFile source(kSharedPackages, "shared.vhd");
  CliResult text = RunQuillon({"tree", source.path()});
  EXPECT_EQ(text.status, 0) << text.err;
  std::string at = "  shared.vhd";
  EXPECT_EQ(Lines(text.out), (std::vector<std::string>{
                                 "user_a [PackageDecl]" + at,
                                 "  common [work:PackageDecl]" + at,
                                 "    base [work:PackageDecl]" + at,
                                 "user_b [PackageDecl]" + at,
                                 "  common [work:PackageDecl] (shared, see above)",
                             }));

  Json answer = TreeOf({source.path()});
  const Json& again = answer["root"]["children"][1]["children"][0];
  EXPECT_EQ(again["name"], "work:PackageDecl|common");
  EXPECT_EQ(again["shared"], true);
  EXPECT_TRUE(again["children"].empty());
  const Json& first = answer.at(Json::json_pointer(again["firstOccurrence"].get<std::string>()));
  EXPECT_EQ(first["name"], "work:PackageDecl|common");
  EXPECT_EQ(first["children"][0]["name"], "work:PackageDecl|base");
  EXPECT_FALSE(first.contains("shared"));

  // Drawn once, with an edge from each user.
  CliResult dot = RunQuillon({"--format", "dot", "tree", source.path()});
  EXPECT_EQ(dot.status, 0) << dot.err;
  std::string tooltip = "tooltip=\"" + source.path() + "\", shape=ellipse];";
  EXPECT_EQ(Lines(dot.out), (std::vector<std::string>{
                                "digraph hierarchy {",
                                "  rankdir=LR;",
                                "  newrank=true;",
                                "  nodesep=0.15;",
                                "  node [shape=box, fontsize=10];",
                                "  subgraph \"cluster_work\" {",
                                "    label=\"work\";",
                                "    n0 [label=\"user_a\\nPackageDecl\", " + tooltip,
                                "    n1 [label=\"common\\nPackageDecl\", " + tooltip,
                                "    n2 [label=\"base\\nPackageDecl\", " + tooltip,
                                "    n3 [label=\"user_b\\nPackageDecl\", " + tooltip,
                                "  }",
                                "  n0 -> n1;",
                                "  n1 -> n2;",
                                "  n3 -> n1;",
                                "}",
                            }));
}

// Deeper than a printer that recursed once per level could go in the sanitizer build.
constexpr int kChainDepth = 8000;

TEST(Hierarchy, DeepChainsPrintAndOrderWithoutRecursion) {
  std::string modules;
  std::string packages;
  for (int i = 0; i < kChainDepth; ++i) {
    std::string next = std::to_string(i + 1);
    modules += "module m" + std::to_string(i) + ";\n";
    if (i + 1 < kChainDepth) modules += "  m" + next + " u ();\n";
    modules += "endmodule\n";
    if (i + 1 < kChainDepth) packages += "use work.p" + next + ".all;\n";
    packages += "package p" + std::to_string(i) + " is\nend package;\n";
  }
  ScopedTextFile verilog(modules, "chain.v");
  std::string vhdl = verilog.Beside("chain.vhd");
  { std::ofstream(vhdl) << packages; }

  CliResult tree = RunQuillon({"tree", verilog.path(), vhdl});
  ASSERT_EQ(tree.status, 0) << tree.err;
  std::vector<std::string> lines = Lines(tree.out);
  ASSERT_EQ(lines.size(), 2u * kChainDepth);
  std::string indent(2 * 100, ' ');
  EXPECT_EQ(lines[kChainDepth - 1], indent + "(level " + std::to_string(kChainDepth - 1) + ") u: m" +
                                        std::to_string(kChainDepth - 1) + " [work:Module]  chain.v");

  CliResult order = RunQuillon({"order", verilog.path(), vhdl});
  ASSERT_EQ(order.status, 0) << order.err;
  EXPECT_EQ(Lines(order.out).size(), 2u);

  // The package chain has no instance paths, whose texts grow with the depth.
  CliResult json = RunQuillon({"--format", "json", "tree", vhdl});
  ASSERT_EQ(json.status, 0) << json.err;
  Json answer = Json::parse(json.out, nullptr, false);
  ASSERT_FALSE(answer.is_discarded());
  int depth = 0;
  for (const Json* node = &answer["root"]; !(*node)["children"].empty(); node = &(*node)["children"][0])
    ++depth;
  EXPECT_EQ(depth, kChainDepth);

  CliResult dot = RunQuillon({"--format", "dot", "tree", verilog.path()});
  ASSERT_EQ(dot.status, 0) << dot.err;
  // Five lines of settings, a cluster of three around the nodes, the closing brace.
  EXPECT_EQ(Lines(dot.out).size(), 2u * kChainDepth - 1 + 9);
}

}  // namespace
}  // namespace cli_test
