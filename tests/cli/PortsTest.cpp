// The ports command and the way a UNIT argument finds its design unit.
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>
#include <string>

#include "CliRun.h"

namespace cli_test {
namespace {

nlohmann::json ParseJson(const CliResult& result) {
  nlohmann::json answer = nlohmann::json::parse(result.out, nullptr, false);
  EXPECT_FALSE(answer.is_discarded()) << result.out;
  return answer;
}

// The unit that a UNIT argument found, as the ports command names it.
std::string UnitFoundFor(const std::string& unit) {
  CliResult result =
      RunQuillon({"-q", "--format", "json", "ports", unit, "-P", DataPath("mixed/project.json")});
  nlohmann::json answer = ParseJson(result);
  return answer.is_object() && answer["unit"].is_string() ? answer["unit"].get<std::string>()
                                                          : "<nothing found: " + result.err + ">";
}

TEST(Ports, PlainNameFindsTheEntityBeforeOtherUnitsOfThatName) {
  EXPECT_EQ(UnitFoundFor("core"), "Entity|core");
  EXPECT_EQ(UnitFoundFor("CORE"), "Entity|core");
  EXPECT_EQ(UnitFoundFor("shared_pkg"), "PackageDecl|shared_pkg");
  EXPECT_EQ(UnitFoundFor("readme.notes"), "Generic|readme.notes");
}

TEST(Ports, DesignUnitKeyFindsExactlyThatUnit) {
  EXPECT_EQ(UnitFoundFor("Architecture|core|rtl"), "Architecture|core|rtl");
  EXPECT_EQ(UnitFoundFor("architecture|CORE|rtl"), "Architecture|core|rtl");
  EXPECT_EQ(UnitFoundFor("Entity|lane"), "Entity|lane");
}

TEST(Ports, TextShowsOnePortALineWithTheRangeFromHighToLow) {
  CliResult result = RunQuillon({"ports", "dial", DataPath("ports/dial.vhd")});
  EXPECT_EQ(result.status, 0) << result.err;
  EXPECT_EQ(result.err, "");
  EXPECT_EQ(Lines(result.out), (std::vector<std::string>{"1 tick in std_logic", "2 value out unsigned 3..0",
                                                         "3 pads inout std_logic_vector 1..0"}));

  // An architecture stands for its entity; a range over a package constant is not evaluated.
  result = RunQuillon({"ports", "Architecture|core|rtl", "-P", DataPath("mixed/project.json")});
  EXPECT_EQ(result.status, 0) << result.err;
  EXPECT_EQ(Lines(result.out), (std::vector<std::string>{"1 clk in std_logic", "2 q out std_logic_vector"}));
}

TEST(Ports, JsonListsTheModulesOwnPortsAlsoForAnInstantiatedModule) {
  CliResult result = RunQuillon({"--format", "json", "ports", "latch", DataPath("ports/relay.v")});
  EXPECT_EQ(result.status, 0) << result.err;
  nlohmann::json expected = nlohmann::json::parse(R"({
    "unit": "Module|latch",
    "ports": [
      {"name": "en", "position": 1, "type": "wire", "direction": "in", "low": null, "high": null, "span": null},
      {"name": "d", "position": 2, "type": "wire", "direction": "in", "low": 0, "high": 7, "span": 7},
      {"name": "q", "position": 3, "type": "reg", "direction": "out", "low": 0, "high": 7, "span": 7}
    ],
    "messages": []
  })");
  EXPECT_EQ(ParseJson(result), expected);
}

TEST(Ports, UnitsWithoutPortsFailWithTheReason) {
  struct Case {
    std::vector<std::string> args;
    std::string message;
  };
  const Case cases[] = {
      {{"ports", "meter", DataPath("ports/meter.vhd")},
       "ports of Entity|meter: not every generic or parameter of 'meter' has a value"},
      {{"ports", "shared_pkg", "-P", DataPath("mixed/project.json")},
       "ports of PackageDecl|shared_pkg: only entities, architectures and modules have ports"},
      {{"ports", "readme.notes", "-P", DataPath("mixed/project.json")},
       "the ports of Generic|readme.notes are not available: ports are extracted from VHDL and Verilog only"},
  };
  for (const Case& c : cases) {
    CliResult text = RunQuillon(c.args);
    EXPECT_EQ(text.status, 1) << c.message;
    EXPECT_EQ(text.out, "");
    EXPECT_EQ(text.err, "ERROR: " + c.message + "\n");

    std::vector<std::string> args{"-q", "--format", "json"};
    args.insert(args.end(), c.args.begin(), c.args.end());
    CliResult json = RunQuillon(args);
    EXPECT_EQ(json.status, 1) << c.message;
    EXPECT_EQ(json.err, "");  // -q: no messages on standard error
    nlohmann::json answer = ParseJson(json);
    EXPECT_TRUE(answer["ports"].is_null());
    ASSERT_EQ(answer["messages"].size(), 1u) << json.out;
    EXPECT_EQ(answer["messages"][0]["severity"], "error");
    EXPECT_EQ(answer["messages"][0]["text"], c.message);
  }
}

}  // namespace
}  // namespace cli_test
