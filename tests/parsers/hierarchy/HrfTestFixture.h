// Reads hierarchy descriptions as a file of a project, through the project's own reader or
// through the converter-output grammar, and describes what was recorded: one line per unit, in
// the order of the file's unit set.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <string_view>
#include <vector>

#include "CHdlElement.h"
#include "CParserConfigHolder.h"
#include "TestHost.h"
#include "qhParser.h"

namespace hrf_test {

class HierarchyRead : public test_host::ParseTest {
 protected:
  // The texts of the errors issued, one after another.
  std::string Errors() const {
    std::string texts;
    for (const std::string& text : messages_.Texts(Port_MsgMan::kError)) texts += text;
    return texts;
  }

  // Reads `text` as a hierarchy file of the project (plug-in "PLUGIN_Hrf").
  std::vector<std::string> ReadProjectFile(std::string_view text) { return ReadProjectPath(Write(text)); }
  std::vector<std::string> ReadProjectPath(const std::string& path) {
    return Describe(ParseAs(path, "PLUGIN_Hrf"));
  }

  // Reads `text` with the grammar, as the converter parsers do, into a file's holder with its
  // default type slots. `result` gets qhParser's result.
  std::vector<std::string> ReadConverterOutput(std::string_view text, int& result) {
    return ReadConverterPath(Write(text), result);
  }
  std::vector<std::string> ReadConverterPath(const std::string& path, int& result) {
    file_ = AddNewFile(project_.Get(), path, "PLUGIN_Hrf");
    Vad::CParserConfigHolder* holder = HolderOf(file_.Get());
    holder->BeginParse(nullptr);
    result = Vad::qhParser(Port::StringBase(path), *holder).Parse();
    holder->EndParse();
    return Describe(holder->GetUnitSet());
  }

  // A new file in the test's directory holding exactly these bytes.
  std::string Write(std::string_view bytes) {
    return ParseTest::Write("design" + std::to_string(++fileCount_) + ".hrf", bytes);
  }

  static std::vector<std::string> Describe(Vad::IHdlDesignUnitSet* set) {
    return DescribeUnits(set, [](CitI::IInterface* unit) { return Describe(unit); });
  }

  static std::string Describe(CitI::IInterface* unit) { return DescribeRecord(unit, KindOf); }

  // The identifiers of hierarchy files and of the holder's default slots.
  static std::string KindOf(const Port::XUID& type) {
    static constexpr TypeName kKinds[] = {{"{F8EC4980-CDA2-4346-9E3C-DB50D7DA83E9}", "instance"},
                                          {"{15B800DC-CD3B-45f9-B26A-26BFDD3441EF}", "entity"},
                                          {"{C15358C8-D5ED-4619-9ADB-1D607C75747B}", "use"},
                                          {"{6DCC6CCB-40B6-4f09-9AB3-C3593438F5B2}", "architecture"},
                                          {"{35077F2B-87EA-47ac-834F-8C02E49945F0}", "package-body"},
                                          {"{98867360-CC87-4033-AB17-973F0CEB374F}", "package"},
                                          {"{AE4C9C94-8BAF-44e7-8443-58AD260CF311}", "module"},
                                          {"{2391D1AB-9BB0-4a61-A080-3CE4BFE2E116}", "test-vector"}};
    return NameOfType(type, kKinds);
  }

  int fileCount_ = 0;
  test_host::MessageLog messages_;
};

}  // namespace hrf_test
