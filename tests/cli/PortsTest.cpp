// The ports command and the way a UNIT argument finds its design unit.
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "CliRun.h"

namespace cli_test {
namespace {

// A plain name finds the entity before other units of that name; a design-unit key exactly that
// unit; neither minds the letter case.
TEST(Ports, UnitArgumentFindsTheUnitByNameOrKey) {
  const std::vector<std::pair<std::string, std::string>> cases = {
      {"core", "Entity|core"},
      {"CORE", "Entity|core"},
      {"shared_pkg", "PackageDecl|shared_pkg"},
      {"readme.notes", "Generic|readme.notes"},
      {"Architecture|core|rtl", "Architecture|core|rtl"},
      {"architecture|CORE|rtl", "Architecture|core|rtl"},
      {"Entity|lane", "Entity|lane"},
  };
  for (const auto& [unit, found] : cases) {
    CliResult result =
        RunQuillon({"-q", "--format", "json", "ports", unit, "-P", DataPath("mixed/project.json")});
    EXPECT_EQ(nlohmann::json::parse(result.out)["unit"], found) << unit;
  }
}

TEST(Ports, OnePortALineWithTheRangeFromHighToLow) {
  ExpectOutputsMatch({
      {"ports-dial.txt", {"ports", "dial", DataPath("ports/dial.vhd")}},
      // An architecture stands for its entity; a range over a package constant is not evaluated.
      {"ports-core.txt", {"ports", "Architecture|core|rtl", "-P", DataPath("mixed/project.json")}},
      // The module's own ports, also for an instantiated module.
      {"ports-latch.json", {"--format", "json", "ports", "latch", DataPath("ports/relay.v")}},
  });
  EXPECT_EQ(RunQuillon({"ports", "dial", DataPath("ports/dial.vhd")}).err, "");
}

TEST(Ports, UnitsWithoutPortsFailWithTheReason) {
  const std::vector<std::pair<std::vector<std::string>, std::string>> cases = {
      {{"ports", "meter", DataPath("ports/meter.vhd")},
       "ports of Entity|meter: not every generic or parameter of 'meter' has a value"},
      {{"ports", "shared_pkg", "-P", DataPath("mixed/project.json")},
       "ports of PackageDecl|shared_pkg: only entities, architectures and modules have ports"},
      {{"ports", "readme.notes", "-P", DataPath("mixed/project.json")},
       "the ports of Generic|readme.notes are not available: ports are extracted from VHDL and Verilog only"},
  };
  for (const auto& [args, message] : cases) {
    CliResult text = RunQuillon(args);
    EXPECT_EQ(text.status, 1) << message;
    EXPECT_EQ(text.out, "");
    EXPECT_EQ(text.err, "ERROR: " + message + "\n");

    std::vector<std::string> jsonArgs{"-q", "--format", "json"};
    jsonArgs.insert(jsonArgs.end(), args.begin(), args.end());
    CliResult json = RunQuillon(jsonArgs);
    EXPECT_EQ(json.status, 1) << message;
    EXPECT_EQ(json.err, "");  // -q: no messages on standard error
    nlohmann::json answer = nlohmann::json::parse(json.out);
    EXPECT_TRUE(answer["ports"].is_null());
    ASSERT_EQ(answer["messages"].size(), 1u) << json.out;
    EXPECT_EQ(answer["messages"][0]["severity"], "error");
    EXPECT_EQ(answer["messages"][0]["text"], message);
  }
}

}  // namespace
}  // namespace cli_test
