// Parses VHDL text as a file of a project, the way a host does, and describes what the parse
// recorded: one line per unit, in the order of the file's unit set.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <string_view>
#include <vector>

#include "CVhdlDU.h"
#include "TestHost.h"
#include "VhdlParser.h"

namespace vhdl_test {

using Strings = std::vector<std::string>;

class VhdlParse : public test_host::ParseTest {
 protected:
  // Writes `source` into a new file of the project, parses it and describes its units.
  Strings Parse(std::string_view source) { return ParseFile(Write(source)); }
  Strings ParseFile(const std::string& path) { return Describe(ParseAs(path, "PLUGIN_Vhdl")); }
  static Strings Describe(Vad::IHdlDesignUnitSet* set) {
    return DescribeUnits(set, [](CitI::IInterface* unit) { return Describe(unit); });
  }
  std::string Write(std::string_view bytes) {
    return ParseTest::Write("unit" + std::to_string(++fileCount_) + ".vhd", bytes);
  }

  struct Case {
    const char* behaviour;
    std::string source;
    Strings units;
  };
  void ExpectParses(std::initializer_list<Case> cases) {
    for (const Case& c : cases) {
      SCOPED_TRACE(c.behaviour);
      EXPECT_EQ(Parse(c.source), c.units);
    }
  }

  void SetParseTarget(std::string_view target) { SetProperty(project_.Get(), "PROP_Parse_Target", target); }

  // "<store key> line <n> <kind>", then as they apply: "parent <store key>", "generate" (inside a
  // generate statement), "flag" (the unit flag; an entity's port flag) and "uses [<store keys>]"
  // for VHDL design units.
  static std::string Describe(CitI::IInterface* unit) {
    auto* element = Prjrep::ImplementationCast<Vad::CHdlElement>(unit);
    if (!element) return "<not a record>";
    std::string text = element->GetKey().str() + " line " + std::to_string(element->GetLine()) + " " +
                       KindOf(element->GetDesignUnitTypeId());
    if (element->GetParent()) text += " parent " + element->GetParent()->GetKey().str();
    if (element->IsInGenerate()) text += " generate";
    if (element->GetUnitFlag()) text += " flag";
    if (auto* vhdlUnit = dynamic_cast<Vad::CVhdlDU*>(element)) {
      std::vector<Vad::DbObject*> uses;
      vhdlUnit->GetUses(uses);
      text += " uses [";
      for (std::size_t i = 0; i < uses.size(); ++i) text += (i ? " " : "") + uses[i]->GetKey().str();
      text += "]";
    }
    return text;
  }

  static std::string KindOf(const Port::XUID& type) {
    namespace Ids = Vad::VhdlTypeIds;
    if (type == Ids::Library()) return "library";
    if (type == Ids::Use()) return "use";
    if (type == Ids::Entity()) return "entity";
    if (type == Ids::Architecture()) return "architecture";
    if (type == Ids::Package()) return "package";
    if (type == Ids::PackageBody()) return "package-body";
    if (type == Ids::Instance()) return "instance";
    return "type " + type.ToString();
  }

  int fileCount_ = 0;
};

}  // namespace vhdl_test
