// Shared set-up of the compile-order tests: projects of the fixture files under
// tests/data/order/, made and read the way a host does, with the messages collected.
#pragma once

#include <gtest/gtest.h>

#include <initializer_list>
#include <string>
#include <string_view>
#include <vector>

#include "CCompileOrder.h"
#include "CElaborator.h"
#include "CHdlProject.h"
#include "DbObject.h"
#include "HdlSets.h"
#include "Host/FileType.h"
#include "Host/HostComponents.h"
#include "ICompAdmin.h"
#include "IHdlDesignUnit.h"
#include "IHdlElaborationData.h"
#include "IHdlFile.h"
#include "IHdlNetListNode.h"
#include "IHdlProject.h"
#include "Identifiers.h"
#include "Port/MsgCollector.h"
#include "Port/MsgDispatcher.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/Casts.h"

extern "C" void InstFactoryEntry();

namespace order_test {

class OrderTest : public testing::Test {
 protected:
  static void SetUpTestSuite() {
    ASSERT_TRUE(Host::RegisterHostComponents());
    InstFactoryEntry();
  }

  void SetUp() override {
    project_ = Prjrep::CreateInstanceAs<Vad::IHdlProject>(Vad::ClassIds::CHdlProject());
    ASSERT_TRUE(project_);
    // The collector takes the messages instead of the terminal (parses re-register the managers
    // they found, so the default one stays out until TearDown).
    defaultWasRegistered_ = Port_MsgDispatcher::removeMsgMan(Port_MsgDispatcher::getDefaultMsgMan());
    ASSERT_TRUE(Port_MsgDispatcher::addMsgMan(&collector_));
  }
  void TearDown() override {
    Port_MsgDispatcher::removeMsgMan(&collector_);
    if (defaultWasRegistered_) Port_MsgDispatcher::addMsgMan(Port_MsgDispatcher::getDefaultMsgMan());
  }

  static std::string DataPath(std::string_view folder, std::string_view name) {
    return std::string(QUILLON_TEST_DATA_DIR) + "/order/" + std::string(folder) + "/" + std::string(name);
  }

  // The warning line that names a file of a listed cycle.
  static std::string CycleLine(std::string_view folder, std::string_view name) {
    return Warning("          " + DataPath(folder, name) + "\n");
  }
  static std::string Warning(std::string_view text) { return "warning: " + std::string(text); }
  static std::string Error(std::string_view text) { return "error: " + std::string(text); }

  Prjrep::AutoPtr<Vad::IHdlFile> AddFile(std::string_view folder, std::string_view name,
                                         std::string_view plugin = "PLUGIN_Vhdl") {
    return AddFileAt(DataPath(folder, name), plugin);
  }
  Prjrep::AutoPtr<Vad::IHdlFile> AddFileAt(const std::string& path, std::string_view plugin = "PLUGIN_Vhdl") {
    Prjrep::AutoPtr<Vad::IHdlFile> file;
    EXPECT_EQ(project_->createNewFile(file.Out()), CitI::kOk);
    auto fileType = Host::FileType::Create("HDL", {"vhd"});
    EXPECT_EQ(Prjrep::QueryAs<Vad::ICompAdmin>(file.Get())->InitializeAfterCreate(nullptr, fileType.Get()),
              CitI::kOk);
    EXPECT_EQ(file->setFilePath(Port::StringBase(path), Port::StringBase()), CitI::kOk);
    file->setPluginName(Port::StringBase(plugin));
    EXPECT_EQ(Prjrep::QueryAs<Vad::IHdlFileSet>(project_.Get())->Add(file.Get()), CitI::kOk);
    return file;
  }
  void AddFiles(std::string_view folder, std::initializer_list<std::string_view> names) {
    for (std::string_view name : names) AddFile(folder, name);
  }

  Vad::IHdlElaborationData* Elaboration() const {
    return Prjrep::QueryAs<Vad::IHdlElaborationData>(project_.Get());
  }

  // Elaborates now, so that the elaboration's own messages are not taken for the compile
  // order's, and forgets the messages so far.
  Prjrep::AutoPtr<Vad::IHdlNetListNode> Root() {
    Prjrep::AutoPtr<Vad::IHdlNetListNode> root;
    EXPECT_EQ(Elaboration()->getHierarchyRoot(root.Out()), CitI::kOk);
    collector_.clearRecords();
    return root;
  }

  // The file names (without directory) an order yields, in order.
  static std::vector<std::string> FileNames(Vad::IHdlFileIterator* order) {
    std::vector<std::string> names;
    if (!order) return names;
    for (order->First(); !order->IsDone(); order->Next()) {
      Port::StringBase directory;
      Port::StringBase name;
      order->Current()->getFileName(&directory, &name);
      names.push_back(name.str());
    }
    return names;
  }

  std::vector<std::string> ProjectOrder() {
    Prjrep::AutoPtr<Vad::IHdlFileIterator> order;
    EXPECT_EQ(Elaboration()->getCompileOrder(nullptr, order.Out()), CitI::kOk);
    return FileNames(order.Get());
  }

  // Every message so far as "<type>: <text>".
  std::vector<std::string> Messages() const {
    std::vector<std::string> messages;
    for (const Port_MsgRecord& record : collector_.records()) {
      messages.push_back(std::string(Port_MsgMan::typeName(record.type)) + ": " + record.text);
    }
    return messages;
  }

  // The project's design unit whose design-unit key is `key` ("Architecture|mid|rtl").
  Prjrep::AutoPtr<Vad::IHdlDesignUnit> Unit(std::string_view key) {
    Prjrep::AutoRelease<Vad::IHdlDesignUnitSet> units;
    EXPECT_EQ(project_->getAllDesignUnits(units.Out()), CitI::kOk);
    Prjrep::AutoRelease<Vad::IHdlDesignUnitIterator> unit;
    EXPECT_EQ(units->CreateIterator(unit.Out()), CitI::kOk);
    for (; !unit->IsDone(); unit->Next()) {
      auto* object = Prjrep::ImplementationCast<Vad::DbObject>(unit->Current());
      Port::StringBase unitKey;
      if (object) object->GetDesignUnitKey(unitKey);
      if (unitKey.view() == key) return Prjrep::AutoPtr<Vad::IHdlDesignUnit>(unit->Current());
    }
    ADD_FAILURE() << "no design unit " << key;
    return {};
  }

  Prjrep::AutoPtr<Vad::CElaborator> Elaborator() const {
    Prjrep::AutoPtr<Vad::CElaborator> elaborator;
    EXPECT_EQ(Prjrep::ObjectCast<Vad::CHdlProject>(project_.Get())->getElaborator(elaborator.Out()),
              CitI::kOk);
    return elaborator;
  }

  Vad::CLibRefs* References() const {
    return Prjrep::ObjectCast<Vad::CHdlProject>(project_.Get())->getLibraryReferences();
  }

  Prjrep::AutoPtr<Vad::IHdlProject> project_;
  Port_MsgCollector collector_;
  bool defaultWasRegistered_ = false;
};

}  // namespace order_test
