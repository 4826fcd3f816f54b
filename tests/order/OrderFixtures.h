// Shared set-up of the compile-order tests: projects of the fixture files under
// tests/data/order/, made and read the way a host does, with the messages collected.
#pragma once

#include <initializer_list>
#include <string>
#include <string_view>
#include <vector>

#include "CCompileOrder.h"
#include "CElaborator.h"
#include "CHdlProject.h"
#include "IHdlElaborationData.h"
#include "IHdlNetListNode.h"
#include "TestHost.h"

namespace order_test {

using Strings = std::vector<std::string>;

class OrderTest : public test_host::PipelineTest {
 protected:
  void SetUp() override {
    project_ = NewProject();
    log_.SilenceTerminal();
  }

  static std::string DataPath(std::string_view folder, std::string_view name) {
    return std::string(QUILLON_TEST_DATA_DIR) + "/order/" + std::string(folder) + "/" + std::string(name);
  }
  // The warning line that names a file of a listed cycle.
  static std::string CycleLine(std::string_view folder, std::string_view name) {
    return Warning("          " + DataPath(folder, name) + "\n");
  }
  static std::string Warning(std::string_view text) { return "warning: " + std::string(text); }

  Prjrep::AutoPtr<Vad::IHdlFile> AddFile(std::string_view folder, std::string_view name,
                                         std::string_view plugin = "PLUGIN_Vhdl") {
    return AddNewFile(project_.Get(), DataPath(folder, name), plugin);
  }
  void AddFiles(std::string_view folder, std::initializer_list<std::string_view> names) {
    for (std::string_view name : names) AddFile(folder, name);
  }
  // A fresh project of the files, elaborated, its messages so far forgotten.
  void LoadProject(std::string_view folder, std::initializer_list<std::string_view> names) {
    project_ = NewProject();
    AddFiles(folder, names);
    Root();
  }

  Vad::IHdlElaborationData* Elaboration() const {
    return Prjrep::QueryAs<Vad::IHdlElaborationData>(project_.Get());
  }

  // Elaborates now, so that the elaboration's own messages are not taken for the compile
  // order's, and forgets the messages so far.
  Prjrep::AutoPtr<Vad::IHdlNetListNode> Root() {
    Prjrep::AutoPtr<Vad::IHdlNetListNode> root;
    EXPECT_EQ(Elaboration()->getHierarchyRoot(root.Out()), CitI::kOk);
    log_.Clear();
    return root;
  }

  // The file names (without directory) an order yields, in order.
  static Strings FileNames(Vad::IHdlFileIterator* order) {
    Strings names;
    if (!order) return names;
    for (order->First(); !order->IsDone(); order->Next()) {
      Port::StringBase directory;
      Port::StringBase name;
      order->Current()->getFileName(&directory, &name);
      names.push_back(name.str());
    }
    return names;
  }

  Strings ProjectOrder() {
    Prjrep::AutoPtr<Vad::IHdlFileIterator> order;
    EXPECT_EQ(Elaboration()->getCompileOrder(nullptr, order.Out()), CitI::kOk);
    return FileNames(order.Get());
  }

  Strings Messages() const { return log_.Lines(); }

  Prjrep::AutoPtr<Vad::IHdlDesignUnit> Unit(std::string_view key) {
    Prjrep::AutoRelease<Vad::IHdlDesignUnitSet> units;
    EXPECT_EQ(project_->getAllDesignUnits(units.Out()), CitI::kOk);
    return test_host::UnitWithKey(units.Get(), key);
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

  test_host::MessageLog log_;
  Prjrep::AutoPtr<Vad::IHdlProject> project_;
};

}  // namespace order_test
