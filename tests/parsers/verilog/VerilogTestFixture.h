// Verilog files of a project made the way a host makes them (plug-in "PLUGIN_Verilog", V3 flag,
// order keys), parsed through the project, and what their parses recorded, one line a unit.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdint>
#include <cstdio>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "CHdlElement.h"
#include "Port/Env.h"
#include "ScopedEnv.h"
#include "TestHost.h"
#include "VerilogArguments.h"
#include "VerilogParser.h"

namespace verilog_test {

inline constexpr const char* kVerilogPlugin = "PLUGIN_Verilog";

class VerilogProject : public test_host::ParseTest {
 protected:
  Prjrep::AutoPtr<Vad::IHdlFile> AddVerilog(const std::string& path, std::uint64_t orderKey, bool v3 = true) {
    auto file = AddNewFile(project_.Get(), path, kVerilogPlugin);
    EXPECT_EQ(file->setOrderKey(orderKey), CitI::kOk);
    EXPECT_EQ(Prjrep::QueryAs<Vad::IHdlFileV3>(file.Get())->setV3Flag(v3), CitI::kOk);
    return file;
  }

  // Writes the sources and adds them in project order: the first gets the largest order key.
  std::vector<Prjrep::AutoPtr<Vad::IHdlFile>> AddInOrder(
      const std::vector<std::pair<std::string, std::string>>& namedSources) {
    std::vector<Prjrep::AutoPtr<Vad::IHdlFile>> files;
    std::uint64_t orderKey = 100 * namedSources.size();
    for (const auto& [name, source] : namedSources) {
      files.push_back(AddVerilog(Write(name, source), orderKey));
      orderKey -= 100;
    }
    return files;
  }

  // Brings every file of the project up to date, as a host does when it asks for the units.
  void ParseProject() {
    Prjrep::AutoRelease<Vad::IHdlDesignUnitSet> units;
    ASSERT_EQ(project_->getAllDesignUnits(units.Out()), CitI::kOk);
  }

  // Parses one file alone with a parser of its own; answers the compiler's captured messages.
  static std::string ParseAlone(Vad::IHdlFile* file) {
    Vad::CParserConfigHolder* holder = HolderOf(file);
    holder->BeginParse(nullptr);
    Vad::VerilogParser parser;
    parser.Parse(*holder);
    holder->EndParse();
    return parser.CapturedMessages().str();
  }

  static std::vector<std::string> ArgumentsOf(Vad::IHdlFile* file) {
    return Vad::VerilogArguments(*HolderOf(file)).Texts();
  }

  // "<store key> line <n> <kind>", then "parent <store key>" and "flag" (a module's port flag)
  // as they apply; in the order of the file's unit set.
  static std::vector<std::string> Describe(Vad::IHdlFile* file) {
    return DescribeUnits(FileObject(file)->GetUnitSet(),
                         [](CitI::IInterface* unit) { return DescribeRecord(unit, KindOf); });
  }
  static std::string KindOf(const Port::XUID& type) {
    if (type == Vad::VerilogTypeIds::Module()) return "module";
    if (type == Vad::VerilogTypeIds::ModuleInstance()) return "instance";
    return "type " + type.ToString();
  }

  std::string Dir() const { return dir_.path() + "/"; }
};

}  // namespace verilog_test
