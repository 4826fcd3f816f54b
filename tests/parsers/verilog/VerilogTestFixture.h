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
#include "TestHost.h"
#include "Port/Env.h"
#include "Port/MsgCollector.h"
#include "Port/MsgDispatcher.h"
#include "ScopedEnv.h"
#include "ScopedTempDir.h"
#include "VerilogArguments.h"
#include "VerilogParser.h"

namespace verilog_test {

inline constexpr const char* kVerilogPlugin = "PLUGIN_Verilog";

class VerilogProject : public test_host::PipelineTest {
 protected:
  void SetUp() override { project_ = NewProject(); }

  // A file of the test's directory holding exactly these bytes; answers its full path.
  std::string Write(std::string_view name, std::string_view bytes) const {
    const std::string path = dir_.Path(name);
    return WriteBytes(path, bytes);
  }

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
    std::vector<std::string> descriptions;
    for (CitI::IInterface* unit : UnitsOf(FileObject(file)->GetUnitSet())) {
      descriptions.push_back(Describe(unit));
    }
    return descriptions;
  }

  static std::string Describe(CitI::IInterface* unit) {
    auto* element = Prjrep::ImplementationCast<Vad::CHdlElement>(unit);
    if (!element) return "<not a record>";
    std::string text = element->GetKey().str() + " line " + std::to_string(element->GetLine()) + " " +
                       KindOf(element->GetDesignUnitTypeId());
    if (element->GetParent()) text += " parent " + element->GetParent()->GetKey().str();
    if (element->GetUnitFlag()) text += " flag";
    return text;
  }

  static std::string KindOf(const Port::XUID& type) {
    if (type == Vad::VerilogTypeIds::Module()) return "module";
    if (type == Vad::VerilogTypeIds::ModuleInstance()) return "instance";
    return "type " + type.ToString();
  }

  std::string Dir() const { return dir_.path() + "/"; }

  ScopedTempDir dir_;
  Prjrep::AutoPtr<Vad::IHdlProject> project_;
};

// A message manager of the host, registered for one scope in the state given.
class HostManager {
 public:
  explicit HostManager(bool enabled) {
    Port_MsgDispatcher::addMsgMan(&collector_);
    enabled ? collector_.enable() : collector_.disable();
  }
  ~HostManager() { Port_MsgDispatcher::removeMsgMan(&collector_); }
  HostManager(const HostManager&) = delete;
  HostManager& operator=(const HostManager&) = delete;

  const Port_MsgCollector& collector() const { return collector_; }
  bool IsRegistered() const { return Port_MsgDispatcher::isRegistered(&collector_); }

 private:
  Port_MsgCollector collector_;
};

}  // namespace verilog_test
