// Reads EDIF netlists, written to a temporary directory, into a file's holder with one of the
// EDIF parsers, and describes what was recorded and which messages were issued.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <cstdio>
#include <string>
#include <string_view>
#include <vector>

#include "CHdlElement.h"
#include "CParserConfigHolder.h"
#include "EdifParser.h"
#include "EdifParserEx.h"
#include "TestHost.h"
#include "Port/MsgCollector.h"
#include "Port/MsgDispatcher.h"
#include "ScopedTempDir.h"

namespace edif_test {

// Gathers the messages of the process for one scope.
class MessageLog {
 public:
  MessageLog() {
    Port_MsgDispatcher::addMsgMan(&collector_);
    collector_.enable();
  }
  ~MessageLog() { Port_MsgDispatcher::removeMsgMan(&collector_); }
  MessageLog(const MessageLog&) = delete;
  MessageLog& operator=(const MessageLog&) = delete;

  // "<error|warning> <category>: <text>" per message.
  std::vector<std::string> Lines() const {
    std::vector<std::string> lines;
    for (const Port_MsgRecord& record : collector_.records()) {
      const char* type = record.type == Port_MsgMan::kError     ? "error"
                         : record.type == Port_MsgMan::kWarning ? "warning"
                                                                : "other";
      lines.push_back(std::string(type) + " " + record.category + ": " + record.text);
    }
    return lines;
  }

 private:
  Port_MsgCollector collector_;
};

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

class EdifRead : public test_host::PipelineTest {
 protected:
  void SetUp() override { project_ = NewProject(); }

  // Writes `text` as `name` in the test's directory and reads it with a new parser of type P.
  template <typename P>
  std::vector<std::string> Read(std::string_view text, std::string_view name = "netlist.edf") {
    return ReadPath<P>(Write(text, name));
  }

  template <typename P>
  std::vector<std::string> ReadPath(const std::string& path) {
    file_ = AddNewFile(project_.Get(), path, "PLUGIN_Edif");
    Vad::CParserConfigHolder* holder = HolderOf(file_.Get());
    holder->BeginParse(nullptr);
    P parser;
    parser.Parse(*holder);
    holder->EndParse();
    part_ = holder->GetPart().str();
    return Describe(holder->GetUnitSet());
  }

  std::string Write(std::string_view bytes, std::string_view name) {
    std::string path = dir_.Path(name);
    return WriteBytes(path, bytes);
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

  ScopedTempDir dir_;
  Prjrep::AutoPtr<Vad::IHdlProject> project_;
  Prjrep::AutoPtr<Vad::IHdlFile> file_;
  std::string part_;
};

}  // namespace edif_test
