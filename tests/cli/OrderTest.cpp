// The order and check commands end to end.
#include <gtest/gtest.h>

#include <algorithm>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "CliRun.h"

namespace cli_test {
namespace {

TEST(Order, EveryFileComesAfterTheFilesItUsesInEachFormat) {
  const std::string project = DataPath("mixed/project.json");
  const std::string ping = DataPath("cycle/ping.vhd"), pong = DataPath("cycle/pong.vhd");
  ExpectOutputsMatch({
      {"order-mixed.json", {"--format", "json", "order", "-P", project}},
      {"order-mixed.txt", {"order", "-P", project}},
      {"order-mixed-with-library.txt", {"order", "--with-library", "-P", project}},
      {"order-mixed-dot.txt", {"--format", "dot", "order", "-P", project}},  // no edge marked red
      {"order-top-core.txt", {"order", "--top", "core", "-P", project}},     // only the files core needs
      // A package has no order of its own.
      {"order-package.json", {"--format", "json", "order", "--unit", "shared_pkg", "-P", project}, 1},
      // Circular files are reported and still ordered; the cycle's edges are red.
      {"order-cycle-dot.txt", {"-q", "--format", "dot", "order", ping, pong}},
  });
  // -q keeps the warnings off standard error, not out of the answer (whose messages name where in the
  // module they were raised, which no expected file should pin).
  CliResult cycle = RunQuillon({"-q", "--format", "json", "order", ping, pong});
  EXPECT_EQ(cycle.status, 0) << cycle.err;
  EXPECT_EQ(cycle.err, "");
  nlohmann::json answer = nlohmann::json::parse(cycle.out);
  EXPECT_EQ(answer["order"].size(), 2u);
  std::vector<std::string> texts;
  for (const auto& message : answer["messages"]) {
    EXPECT_EQ(message["severity"], "warning");
    texts.push_back(message["text"]);
  }
  EXPECT_NE(std::find(texts.begin(), texts.end(),
                      "File circular dependency detected using rule: define-before-use."),
            texts.end());
}

TEST(Check, SummarisesFilesUnitsAndMessages) {
  CliResult clean = RunQuillon({"check", "-P", DataPath("mixed/project.json")});
  EXPECT_EQ(clean.status, 0) << clean.err;
  // readme.notes, of no HDL plug-in's extension, is the one warning (not-hdl).
  EXPECT_EQ(clean.out, "5 files, 8 design units: 0 errors, 1 warning\n");
  CliResult cyclic =
      RunQuillon({"-q", "--format", "json", "check", DataPath("cycle/ping.vhd"), DataPath("cycle/pong.vhd")});
  EXPECT_EQ(cyclic.status, 0) << cyclic.err;
  nlohmann::json answer = nlohmann::json::parse(cyclic.out);
  EXPECT_EQ(answer["files"], 2);
  EXPECT_EQ(answer["units"], 4);
  EXPECT_FALSE(answer["messages"].empty());
}

}  // namespace
}  // namespace cli_test
