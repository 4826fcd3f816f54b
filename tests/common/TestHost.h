// The shared test host: host components and module factories in the registry, projects and files
// made the way a host makes them, message collection and the environment of the cell libraries.
// Every test area builds on it.
#pragma once

#include <gtest/gtest.h>

#include <cstdio>
#include <string>
#include <string_view>
#include <vector>

#include "CHdlElement.h"
#include "CHdlFile.h"
#include "CParserConfigHolder.h"
#include "DbObject.h"
#include "HdlSets.h"
#include "Host/FileType.h"
#include "Host/HostComponents.h"
#include "Host/PropertyInstance.h"
#include "Host/SourceLibrary.h"
#include "ICompAdmin.h"
#include "IHdlDesignUnit.h"
#include "IHdlFile.h"
#include "IHdlProject.h"
#include "ISourceLibraryMember.h"
#include "Identifiers.h"
#include "Port/Env.h"
#include "Port/File.h"
#include "Port/MsgCollector.h"
#include "Port/MsgDispatcher.h"
#include "Port/MsgManData.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/Casts.h"
#include "RavA/Factory.h"
#include "ScopedEnv.h"
#include "ScopedWorkingDirectory.h"

extern "C" void InstFactoryEntry();

namespace test_host {

// A counted object owned by the test: released when this goes out of scope.
template <class T>
class Owned : public Prjrep::AutoRelease<T> {
 public:
  using Prjrep::AutoRelease<T>::AutoRelease;
  T& operator*() const { return *this->Get(); }
};

// The module's factories in the registry for one test, and an empty registry afterwards.
class RegisteredModule : public testing::Test {
 protected:
  void SetUp() override { InstFactoryEntry(); }
  void TearDown() override { RavA::Factory::Clear(); }
};

// Every message dispatched while it lives, besides the managers already registered.
class CollectedMessages {
 public:
  CollectedMessages() { EXPECT_TRUE(Port_MsgDispatcher::addMsgMan(&collector_)); }
  ~CollectedMessages() { Port_MsgDispatcher::removeMsgMan(&collector_); }
  CollectedMessages(const CollectedMessages&) = delete;
  CollectedMessages& operator=(const CollectedMessages&) = delete;

  const std::vector<Port_MsgRecord>& records() const { return collector_.records(); }
  Port_MsgCollector& collector() { return collector_; }

 private:
  Port_MsgCollector collector_;
};

// The debug text that `action` writes.
template <class Action>
std::string DebugTextOf(Action action) {
  Port_DebugCapture debug;
  action();
  return debug.text();
}

// CORVANE naming the repository's cell libraries, as the command-line host sets it.
class ScopedCellLibraries : public ScopedEnv {
 public:
  ScopedCellLibraries() : ScopedEnv("CORVANE", Port_Env::GetInstallRoot().c_str()) {}
};

inline std::string CurrentDirectory() {
  Port::StringBase dir;
  EXPECT_TRUE(Port::File::getcwd(&dir));
  return dir.str();
}

class PipelineTest : public testing::Test {
 protected:
  static void SetUpTestSuite() {
    ASSERT_TRUE(Host::RegisterHostComponents());
    InstFactoryEntry();
  }

  static Prjrep::AutoPtr<Vad::IHdlProject> NewProject() {
    auto project = Prjrep::CreateInstanceAs<Vad::IHdlProject>(Vad::ClassIds::CHdlProject());
    EXPECT_TRUE(project);
    return project;
  }

  // A file as a host makes one: created by the project, initialised with a file type, given its
  // path and plug-in name; not yet added.
  static Prjrep::AutoPtr<Vad::IHdlFile> NewFile(Vad::IHdlProject* project, std::string_view path,
                                                std::string_view plugin) {
    Prjrep::AutoPtr<Vad::IHdlFile> file;
    EXPECT_EQ(project->createNewFile(file.Out()), CitI::kOk);
    auto fileType = Host::FileType::Create("HDL", {"vhd", "v"});
    auto* admin = Prjrep::QueryAs<Vad::ICompAdmin>(file.Get());
    EXPECT_EQ(admin->InitializeAfterCreate(nullptr, fileType.Get()), CitI::kOk);
    EXPECT_EQ(file->setFilePath(Port::StringBase(path), Port::StringBase()), CitI::kOk);
    file->setPluginName(Port::StringBase(plugin));
    return file;
  }

  static Prjrep::AutoPtr<Vad::IHdlFile> AddNewFile(Vad::IHdlProject* project, std::string_view path,
                                                   std::string_view plugin) {
    auto file = NewFile(project, path, plugin);
    EXPECT_EQ(FileSetOf(project)->Add(file.Get()), CitI::kOk);
    return file;
  }

  static Vad::IHdlFileSet* FileSetOf(Vad::IHdlProject* project) {
    return Prjrep::QueryAs<Vad::IHdlFileSet>(project);
  }
  static Vad::CHdlFile* FileObject(Vad::IHdlFile* file) { return Prjrep::ObjectCast<Vad::CHdlFile>(file); }
  static Vad::CParserConfigHolder* HolderOf(Vad::IHdlFile* file) { return FileObject(file)->GetHolder(); }

  static void SetProperty(Vad::IHdlProject* project, std::string_view name, std::string_view value) {
    Prjrep::AutoRelease<Vad::IHdlParserConfig> config;
    ASSERT_EQ(project->getParserConfig(config.Out()), CitI::kOk);
    auto* properties = Prjrep::QueryAs<Vad::IPropertyInstanceSet>(config.Get());
    ASSERT_NE(properties, nullptr);
    ASSERT_EQ(properties->Add(Host::PropertyInstance::Create(name, value).Get()), CitI::kOk);
  }

  static void SetLibrary(Vad::IHdlFile* file, std::string_view name) {
    auto* member = Prjrep::QueryAs<Vad::ISourceLibraryMember>(file);
    ASSERT_NE(member, nullptr);
    ASSERT_EQ(member->setSourceLibrary(Host::SourceLibrary::Create(name).Get()), CitI::kOk);
  }

  static std::string StoreKeyOf(CitI::IInterface* unit) {
    auto* object = Prjrep::ImplementationCast<Vad::DbObject>(unit);
    return object ? object->GetKey().str() : "<foreign>";
  }

  static std::vector<CitI::IInterface*> UnitsOf(Vad::IHdlDesignUnitSet* set) {
    std::vector<CitI::IInterface*> units;
    Prjrep::AutoRelease<Vad::IHdlDesignUnitIterator> it;
    if (!set || set->CreateIterator(it.Out()) != CitI::kOk) return units;
    for (; !it->IsDone(); it->Next()) units.push_back(it->Current());
    return units;
  }

  // Writes exactly `bytes` to `path` (replacing the file) and answers the path.
  static std::string WriteBytes(const std::string& path, std::string_view bytes) {
    std::FILE* out = std::fopen(path.c_str(), "wb");
    EXPECT_NE(out, nullptr) << path;
    if (out) {
      EXPECT_EQ(std::fwrite(bytes.data(), 1, bytes.size(), out), bytes.size()) << path;
      std::fclose(out);
    }
    return path;
  }

  // One description per unit of `set`, in its order.
  template <class DescribeUnit>
  static std::vector<std::string> DescribeUnits(Vad::IHdlDesignUnitSet* set, DescribeUnit describe) {
    std::vector<std::string> descriptions;
    for (CitI::IInterface* unit : UnitsOf(set)) descriptions.push_back(describe(unit));
    return descriptions;
  }

  // A design-unit type identifier (as text) and the short name tests describe it by.
  struct TypeName {
    const char* id;
    const char* name;
  };

  // The name `names` gives `type`; "type <identifier>" when it gives none.
  template <std::size_t N>
  static std::string NameOfType(const Port::XUID& type, const TypeName (&names)[N]) {
    for (const TypeName& entry : names) {
      if (type == Port::XUID(std::string_view(entry.id))) return entry.name;
    }
    return "type " + type.ToString();
  }

  // "<store key> line <n> <kind>", then "partition <p>", "parent <store key>" and "flag" (the unit
  // flag) as they apply; `kindOf` names the record's type.
  template <class KindOf>
  static std::string DescribeRecord(CitI::IInterface* unit, KindOf kindOf) {
    auto* element = Prjrep::ImplementationCast<Vad::CHdlElement>(unit);
    if (!element) return "<not a record>";
    std::string text = element->GetKey().str() + " line " + std::to_string(element->GetLine()) + " " +
                       kindOf(element->GetDesignUnitTypeId());
    Port::StringBase partition;
    if (element->GetProperty("PARTITION", partition) == CitI::kOk && !partition.IsEmpty()) {
      text += " partition " + partition.str();
    }
    if (element->GetParent()) text += " parent " + element->GetParent()->GetKey().str();
    if (element->GetUnitFlag()) text += " flag";
    return text;
  }

  static std::vector<std::string> StoreKeys(Vad::IHdlDesignUnitSet* set) {
    std::vector<std::string> keys;
    for (CitI::IInterface* unit : UnitsOf(set)) keys.push_back(StoreKeyOf(unit));
    return keys;
  }

  // The units of a file's last parse.
  static std::vector<std::string> FileUnitKeys(Vad::IHdlFile* file) {
    return StoreKeys(FileObject(file)->GetUnitSet());
  }
};

}  // namespace test_host

// ---- Messages, shared by the elaboration, parser, order and ports tests.
#include "Port/MsgCollector.h"
#include "Port/MsgDispatcher.h"

namespace test_host {

// Gathers the messages issued while it lives, as a host's message manager in the state given.
class MessageLog {
 public:
  explicit MessageLog(bool enabled = true) {
    Port_MsgDispatcher::addMsgMan(&collector_);
    enabled ? collector_.enable() : collector_.disable();
  }
  ~MessageLog() {
    Port_MsgDispatcher::removeMsgMan(&collector_);
    if (silenced_) Port_MsgDispatcher::addMsgMan(Port_MsgDispatcher::getDefaultMsgMan());
  }
  MessageLog(const MessageLog&) = delete;
  MessageLog& operator=(const MessageLog&) = delete;

  // Keeps the terminal's manager out until the log goes (parses re-register the managers they
  // found, so it must stay out for the whole scope).
  void SilenceTerminal() {
    silenced_ = Port_MsgDispatcher::removeMsgMan(Port_MsgDispatcher::getDefaultMsgMan());
  }

  const Port_MsgCollector& Collector() const { return collector_; }
  const std::vector<Port_MsgRecord>& Records() const { return collector_.records(); }
  void Clear() { collector_.clearRecords(); }

  std::vector<std::string> Texts(Port_MsgMan::MsgType type) const {
    std::vector<std::string> texts;
    for (const Port_MsgRecord& record : Records())
      if (record.type == type) texts.push_back(record.text);
    return texts;
  }

  // "<type>: <text>" per message; with `category`, every message must be of it.
  std::vector<std::string> Lines(const char* category = nullptr) const {
    std::vector<std::string> lines;
    for (const Port_MsgRecord& record : Records()) {
      if (category) {
        EXPECT_EQ(record.category, category) << record.text;
      }
      lines.push_back(std::string(Port_MsgMan::typeName(record.type)) + ": " + record.text);
    }
    return lines;
  }

 private:
  Port_MsgCollector collector_;
  bool silenced_ = false;
};

}  // namespace test_host

// ---- A design unit of no module of ours: it answers no implementation identity.
namespace test_host {

class ForeignUnit final : public Vad::IHdlDesignUnit {
 public:
  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    return id == Vad::IHdlDesignUnit::Iid() || id == CitI::IInterface::Iid() ? this : nullptr;
  }
  CitI::Result GetDesignUnit(CitI::IInterface*, Vad::IHdlDesignUnit** out) override {
    if (out) *out = nullptr;
    return CitI::kNotImpl;
  }
  CitI::Result GetUnitFlag(std::int32_t, bool*) override { return CitI::kNotImpl; }
  CitI::Result GetDesignUnitTypeId(Port::XUID*) override { return CitI::kNotImpl; }
};

}  // namespace test_host

// ---- The unit of a set whose design-unit key is `key` ("Architecture|mid|rtl").
namespace test_host {

inline Prjrep::AutoPtr<Vad::IHdlDesignUnit> UnitWithKey(Vad::IHdlDesignUnitSet* set, std::string_view key) {
  Prjrep::AutoRelease<Vad::IHdlDesignUnitIterator> unit;
  if (set && set->CreateIterator(unit.Out()) == CitI::kOk) {
    for (; !unit->IsDone(); unit->Next()) {
      Port::StringBase unitKey;
      if (auto* object = Prjrep::ImplementationCast<Vad::DbObject>(unit->Current()))
        object->GetDesignUnitKey(unitKey);
      if (unitKey.view() == key) return Prjrep::AutoPtr<Vad::IHdlDesignUnit>(unit->Current());
    }
  }
  ADD_FAILURE() << "no design unit " << key;
  return {};
}

}  // namespace test_host

// ---- Sources written to a temporary directory and parsed as files of a project, shared by the
// parser tests.
#include "ScopedTempDir.h"

namespace test_host {

class ParseTest : public PipelineTest {
 protected:
  void SetUp() override { project_ = NewProject(); }

  // A file of the test's directory holding exactly `bytes`; its full path.
  std::string Write(std::string_view name, std::string_view bytes) const {
    return WriteBytes(dir_.Path(name), bytes);
  }

  // Adds the file to the project and parses it, as a host does; the units of the parse.
  Vad::IHdlDesignUnitSet* ParseAs(const std::string& path, std::string_view plugin) {
    file_ = AddNewFile(project_.Get(), path, plugin);
    HolderOf(file_.Get())->Parse(nullptr);
    return FileObject(file_.Get())->GetUnitSet();
  }

  // Adds the file to the project and runs a parser of type P alone on its holder.
  template <class P>
  Vad::CParserConfigHolder* RunParser(const std::string& path, std::string_view plugin) {
    file_ = AddNewFile(project_.Get(), path, plugin);
    Vad::CParserConfigHolder* holder = HolderOf(file_.Get());
    holder->BeginParse(nullptr);
    P parser;
    parser.Parse(*holder);
    holder->EndParse();
    return holder;
  }

  ScopedTempDir dir_;
  Prjrep::AutoPtr<Vad::IHdlProject> project_;
  Prjrep::AutoPtr<Vad::IHdlFile> file_;
};

}  // namespace test_host
