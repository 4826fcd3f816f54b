// The tree command end to end: the hierarchy that the module builds in JSON, text and DOT, and the
// parts of it shown when asked (--top, --depth, --instances).
#include <gtest/gtest.h>

#include <fstream>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "CliRun.h"

namespace cli_test {
namespace {

TEST(Hierarchy, TreeShowsEveryNodeWithItsNamesPathAndFile) {
  const std::string project = DataPath("mixed/project.json"), stray = DataPath("stray/stray.vhd");
  ExpectOutputsMatch({
      {"tree-mixed.json", {"-q", "--format", "json", "tree", "-P", project}},
      {"tree-mixed.txt", {"tree", "-P", project}},  // files by base name unless verbose
      {"tree-mixed-verbose.txt", {"-v", "tree", "-P", project}},
      // A unit missing from the project has no element and no file.
      {"tree-stray.json", {"-q", "--format", "json", "tree", stray}},
      {"tree-stray.txt", {"tree", stray}},
  });
}

TEST(Hierarchy, CircularReferenceIsAWarningNotAFailure) {
  CliResult result =
      RunQuillon({"--format", "json", "tree", DataPath("cycle/ping.vhd"), DataPath("cycle/pong.vhd")});
  EXPECT_EQ(result.status, 0) << result.err;
  EXPECT_NE(result.err.find("WARNING: Circular Reference: "), std::string::npos) << result.err;
  // The message names where in the module it was raised, which no expected file should pin.
  nlohmann::json message = nlohmann::json::parse(result.out)["messages"][0];
  EXPECT_EQ(message["severity"], "warning");
  EXPECT_EQ(message["text"].get<std::string>().rfind("Circular Reference: ", 0), 0u) << message;
}

// Two packages use a third; the second occurrence points at the first, unless --top leaves the first
// out. DOT draws the shared package once, with an edge from each user.
TEST(Hierarchy, SharedSubtreeIsShownOnceAndReferencedAfterwards) {
  const std::string source = DataPath("shared/shared.vhd");
  ExpectOutputsMatch({
      {"tree-shared.txt", {"tree", source}},
      {"tree-shared.json", {"-q", "--format", "json", "tree", source}},
      {"tree-shared-dot.txt", {"--format", "dot", "tree", source}},
      {"tree-shared-top-user-b.txt", {"tree", "--top", "user_b", source}},
  });
}

TEST(Hierarchy, TopDepthAndInstancesChooseWhatIsShown) {
  const std::string project = DataPath("mixed/project.json");
  auto tree = [&](std::vector<std::string> options) {
    options.insert(options.begin(), {"tree", "-P", project});
    return options;
  };
  ExpectOutputsMatch({
      // An entity stands for its architecture.
      {"tree-top-core.txt", tree({"--top", "core"})},
      {"tree-top-lane-rtl.txt", tree({"--top", "Architecture|lane|rtl"})},
      {"tree-top-lane.json", tree({"-q", "--format", "json", "--top", "lane"})},
      // --depth counts what it leaves out; --instances leaves out entities and packages.
      {"tree-depth-1.txt", tree({"--depth", "1"})},
      {"tree-depth-0.txt", tree({"--depth", "0"})},
      {"tree-depth-1.json", tree({"-q", "--format", "json", "--depth", "1"})},
      {"tree-instances.txt", tree({"--instances"})},
      {"tree-instances-depth-0.txt", tree({"--instances", "--depth", "0", "--top", "top"})},
  });
}

TEST(Hierarchy, DotDrawsEachUnitOnceInTheClusterOfItsLibraryAndQuotesNames) {
  ExpectOutputsMatch({{"tree-libraries-dot.txt",
                       {"-q", "--format", "dot", "tree", "-l", "util", DataPath("libraries/pkg.vhd"), "-l",
                        "work", DataPath("libraries/design.vhd")}}});

  ScopedTextFile source("package p is\nend package;\n", "odd \"name\".vhd");
  CliResult result = RunQuillon({"-q", "--format", "dot", "order", "-l", "x\"y\\z", source.path()});
  ASSERT_EQ(result.status, 0) << result.err;
  EXPECT_NE(result.out.find("subgraph \"cluster_x\\\"y\\\\z\" {"), std::string::npos) << result.out;
  EXPECT_NE(result.out.find("[label=\"1. odd \\\"name\\\".vhd\""), std::string::npos) << result.out;
}

// Deeper than a printer that recursed once per level could go in the sanitizer build.
constexpr int kChainDepth = 8000;

TEST(Hierarchy, DeepChainsPrintAndOrderWithoutRecursion) {
  std::string modules, packages;
  for (int i = 0; i < kChainDepth; ++i) {
    const std::string next = std::to_string(i + 1);
    const bool last = i + 1 == kChainDepth;
    modules +=
        "module m" + std::to_string(i) + ";\n" + (last ? "" : "  m" + next + " u ();\n") + "endmodule\n";
    packages += (last ? "" : "use work.p" + next + ".all;\n") + "package p" + std::to_string(i) +
                " is\nend package;\n";
  }
  ScopedTextFile verilog(modules, "chain.v");
  const std::string vhdl = verilog.Beside("chain.vhd");
  std::ofstream(vhdl) << packages;

  CliResult tree = RunQuillon({"tree", verilog.path(), vhdl});
  ASSERT_EQ(tree.status, 0) << tree.err;
  std::vector<std::string> lines = Lines(tree.out);
  ASSERT_EQ(lines.size(), 2u * kChainDepth);
  const std::string deepest = std::to_string(kChainDepth - 1);
  EXPECT_EQ(lines[kChainDepth - 1],
            std::string(2 * 100, ' ') + "(level " + deepest + ") u: m" + deepest + " [work:Module]  chain.v");

  CliResult order = RunQuillon({"order", verilog.path(), vhdl});
  ASSERT_EQ(order.status, 0) << order.err;
  EXPECT_EQ(Lines(order.out).size(), 2u);

  // The package chain has no instance paths, whose texts grow with the depth.
  CliResult json = RunQuillon({"--format", "json", "tree", vhdl});
  ASSERT_EQ(json.status, 0) << json.err;
  nlohmann::json answer = nlohmann::json::parse(json.out);
  int depth = 0;
  for (const auto* node = &answer["root"]; !(*node)["children"].empty(); node = &(*node)["children"][0])
    ++depth;
  EXPECT_EQ(depth, kChainDepth);

  CliResult dot = RunQuillon({"--format", "dot", "tree", verilog.path()});
  ASSERT_EQ(dot.status, 0) << dot.err;
  // Five lines of settings, a cluster of three around the nodes, the closing brace.
  EXPECT_EQ(Lines(dot.out).size(), 2u * kChainDepth - 1 + 9);
}

}  // namespace
}  // namespace cli_test
