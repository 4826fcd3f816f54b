// Reads EDIF netlists, written to a temporary directory, into a file's holder with one of the
// EDIF parsers, and describes what was recorded and which messages were issued.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <string>
#include <string_view>
#include <vector>

#include "CHdlElement.h"
#include "CParserConfigHolder.h"
#include "EdifParser.h"
#include "EdifParserEx.h"
#include "TestHost.h"

namespace edif_test {

using test_host::MessageLog;

// Makes a directory the current one for one scope.
class ScopedCurrentDir {
 public:
  explicit ScopedCurrentDir(const std::string& path) {
    char buffer[4096];
    if (getcwd(buffer, sizeof buffer)) saved_ = buffer;
    EXPECT_EQ(chdir(path.c_str()), 0);
  }
  ~ScopedCurrentDir() {
    if (!saved_.empty()) {
      EXPECT_EQ(chdir(saved_.c_str()), 0);
    }
  }
  ScopedCurrentDir(const ScopedCurrentDir&) = delete;
  ScopedCurrentDir& operator=(const ScopedCurrentDir&) = delete;

 private:
  std::string saved_;
};

class EdifRead : public test_host::ParseTest {
 protected:
  // Writes `text` as `name` in the test's directory and reads it with a new parser of type P.
  template <typename P>
  std::vector<std::string> Read(std::string_view text, std::string_view name = "netlist.edf") {
    return ReadPath<P>(Write(name, text));
  }

  template <typename P>
  std::vector<std::string> ReadPath(const std::string& path) {
    Vad::CParserConfigHolder* holder = RunParser<P>(path, "PLUGIN_Edif");
    part_ = holder->GetPart().str();
    return Describe(holder->GetUnitSet());
  }

  static std::vector<std::string> Describe(Vad::IHdlDesignUnitSet* set) {
    return DescribeUnits(set, [](CitI::IInterface* unit) { return Describe(unit); });
  }

  // "<store key> <kind>", then "parent <store key>", "partition <name>" and "line <n>" (a line
  // other than 0) as they apply.
  static std::string Describe(CitI::IInterface* unit) {
    auto* element = Prjrep::ImplementationCast<Vad::CHdlElement>(unit);
    if (!element) return "<not a record>";
    std::string text = element->GetKey().str() + " " + KindOf(element->GetDesignUnitTypeId());
    if (element->GetParent()) text += " parent " + element->GetParent()->GetKey().str();
    Port::StringBase partition;
    if (element->GetProperty(Port::StringBase("PARTITION"), partition) && !partition.IsEmpty())
      text += " partition " + partition.str();
    if (element->GetLine() != 0) text += " line " + std::to_string(element->GetLine());
    return text;
  }

  static std::string KindOf(const Port::XUID& type) {
    if (type == Vad::EdifParser::TopModuleTypeId()) return "top";
    if (type == Vad::EdifParserEx::ModuleTypeId()) return "module";
    if (type == Vad::EdifParserEx::InstanceTypeId()) return "instance";
    return "type " + type.ToString();
  }

  std::string part_;
};

}  // namespace edif_test
