// The ports command and the way a UNIT argument finds its design unit.
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>
#include <string>

#include "CliRun.h"

namespace cli_test {
namespace {

const char* const kUnavailable = "ERROR: port extraction is not available yet (unit ";

// The unit that a UNIT argument found, as the ports command names it.
std::string UnitFoundFor(const std::string& unit) {
  CliResult result = RunQuillon({"ports", unit, "-P", DataPath("mixed/project.json")});
  EXPECT_EQ(result.status, 1) << result.err;
  std::size_t start = result.err.find(kUnavailable);
  if (start == std::string::npos) return "<nothing found: " + result.err + ">";
  start += std::string(kUnavailable).size();
  return result.err.substr(start, result.err.find(')', start) - start);
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

TEST(Ports, UnavailableExtractionIsAnErrorInTheJsonAnswerToo) {
  CliResult result =
      RunQuillon({"-q", "--format", "json", "ports", "top", "-P", DataPath("mixed/project.json")});
  EXPECT_EQ(result.status, 1);
  EXPECT_EQ(result.err, "");  // -q: no messages on standard error
  nlohmann::json answer = nlohmann::json::parse(result.out, nullptr, false);
  ASSERT_FALSE(answer.is_discarded()) << result.out;
  EXPECT_EQ(answer["unit"], "Entity|top");
  EXPECT_TRUE(answer["ports"].is_null());
  ASSERT_EQ(answer["messages"].size(), 1u);
  EXPECT_EQ(answer["messages"][0]["severity"], "error");
  EXPECT_EQ(answer["messages"][0]["source"], "quillon");
  EXPECT_EQ(answer["messages"][0]["text"], "port extraction is not available yet (unit Entity|top)");
}

}  // namespace
}  // namespace cli_test
