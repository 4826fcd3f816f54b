// Parses VHDL text as a file of a project, the way a host does, and describes what the parse
// recorded: one line per unit, in the order of the file's unit set.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdio>
#include <string>
#include <string_view>
#include <vector>

#include "CHdlElement.h"
#include "CVhdlDU.h"
#include "TestHost.h"
#include "ScopedTempDir.h"
#include "VhdlParser.h"

namespace vhdl_test {

class VhdlParse : public test_host::PipelineTest {
 protected:
  void SetUp() override { project_ = NewProject(); }

  // Writes `source` into a new file of the project, parses it and describes its units.
  std::vector<std::string> Parse(std::string_view source) { return ParseFile(Write(source)); }

  std::vector<std::string> ParseFile(const std::string& path) {
    file_ = AddNewFile(project_.Get(), path, "PLUGIN_Vhdl");
    HolderOf(file_.Get())->Parse(nullptr);
    return Describe(FileObject(file_.Get())->GetUnitSet());
  }

  // A new file in the test's directory holding exactly these bytes.
  std::string Write(std::string_view bytes) {
    std::string path = dir_.Path("unit" + std::to_string(++fileCount_) + ".vhd");
    return WriteBytes(path, bytes);
  }

  void SetParseTarget(std::string_view target) { SetProperty(project_.Get(), "PROP_Parse_Target", target); }

  static std::vector<std::string> Describe(Vad::IHdlDesignUnitSet* set) {
    return DescribeUnits(set, [](CitI::IInterface* unit) { return Describe(unit); });
  }

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

  ScopedTempDir dir_;
  Prjrep::AutoPtr<Vad::IHdlProject> project_;
  Prjrep::AutoPtr<Vad::IHdlFile> file_;
  int fileCount_ = 0;
};

}  // namespace vhdl_test
