// Shared set-up of the elaboration tests: files in libraries, design-unit records made by hand,
// and a text rendering of hierarchy trees.
#pragma once

#include <cstdlib>
#include <set>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "CElaborator.h"
#include "CHdlProject.h"
#include "CNetListNode.h"
#include "CVhdlDU.h"
#include "CompInst.h"
#include "IHdlElaborationData.h"
#include "IHdlNetListNode.h"
#include "ITclCollectable.h"
#include "Prjrep/TListIter.h"
#include "TestHost.h"
#include "Use.h"

namespace elab_test {

using test_host::MessageLog;

inline std::string DataPath(std::string_view relative) {
  return std::string(QUILLON_TEST_DATA_DIR) + "/elab/" + std::string(relative);
}

class ElabTest : public test_host::PipelineTest {
 protected:
  static void SetUpTestSuite() {
    PipelineTest::SetUpTestSuite();
    // The cell libraries of the repository's data folder stand in for an installation.
    setenv("CORVANE", (std::string(QUILLON_TEST_DATA_DIR) + "/../../data").c_str(), 0);
  }
  void SetUp() override { project_ = NewProject(); }

  // A file of the project in `library`, as a host makes one; AddFile adds it to the project.
  Prjrep::AutoPtr<Vad::IHdlFile> MakeFile(std::string_view path, std::string_view library = "work",
                                          std::string_view plugin = "PLUGIN_Vhdl",
                                          std::uint64_t orderKey = 0) {
    auto file = NewFile(project_.Get(), path, plugin);
    file->setOrderKey(orderKey);
    SetLibrary(file.Get(), library);
    return file;
  }
  Prjrep::AutoPtr<Vad::IHdlFile> AddFile(std::string_view path, std::string_view library = "work",
                                         std::string_view plugin = "PLUGIN_Vhdl",
                                         std::uint64_t orderKey = 0) {
    auto file = MakeFile(path, library, plugin, orderKey);
    EXPECT_EQ(FileSetOf(project_.Get())->Add(file.Get()), CitI::kOk);
    return file;
  }

  Prjrep::AutoPtr<Vad::IHdlNetListNode> HierarchyRoot() {
    Prjrep::AutoPtr<Vad::IHdlNetListNode> root;
    EXPECT_EQ(Prjrep::QueryAs<Vad::IHdlElaborationData>(project_.Get())->getHierarchyRoot(root.Out()),
              CitI::kOk);
    return root;
  }
  Vad::CHdlProject* ProjectObject() const { return Prjrep::ObjectCast<Vad::CHdlProject>(project_.Get()); }
  Vad::CLibRefs* References() const { return ProjectObject()->getLibraryReferences(); }

  // A record made by hand in `file` (for its library), kept by the test.
  template <class Record, class... Args>
  CitI::IInterface* Unit(Vad::IHdlFile* file, Args&&... args) {
    auto* record = new Record(std::forward<Args>(args)...);
    record->SetFile(file);
    units_.emplace_back(record);
    return units_.back().Get();
  }
  // An instance under `parent`, which keeps it.
  static Vad::CompInst* Component(CitI::IInterface* parent, std::string_view label,
                                  std::string_view component) {
    Prjrep::AutoRelease<CitI::IInterface> made(
        new Vad::CompInst(label, component, RecordOf<Vad::DbObject>(parent)));
    return RecordOf<Vad::CompInst>(made.Get());
  }
  // A use clause in effect for the VHDL unit, in the unit's file.
  void Uses(CitI::IInterface* unit, std::string_view selectedName) {
    Prjrep::AutoRelease<Vad::IHdlFile> file;
    ElementOf(unit)->GetFile(file.Out());
    CitI::IInterface* use = Unit<Vad::Use>(file.Get(), selectedName, nullptr);
    auto* vhdlUnit = RecordOf<Vad::CVhdlDU>(unit);
    std::vector<Vad::DbObject*> uses;
    vhdlUnit->GetUses(uses);
    uses.push_back(RecordOf<Vad::DbObject>(use));
    vhdlUnit->SetUses(uses);
  }

  static Vad::IHdlElement* ElementOf(CitI::IInterface* unit) {
    return Prjrep::QueryAs<Vad::IHdlElement>(unit);
  }
  template <class Record>
  static Record* RecordOf(CitI::IInterface* unit) {
    return dynamic_cast<Record*>(Prjrep::ImplementationCast<Vad::DbObject>(unit));
  }

  // An iterator over units, as the project hands them to the elaborator.
  static Prjrep::AutoRelease<Vad::IHdlDesignUnitIterator> IterateUnits(
      const std::vector<CitI::IInterface*>& units) {
    std::vector<Vad::IHdlDesignUnit*> designUnits;
    for (CitI::IInterface* unit : units) designUnits.push_back(Prjrep::QueryAs<Vad::IHdlDesignUnit>(unit));
    return Prjrep::TInterfaceListIter<Vad::IHdlDesignUnitIterator>::New(designUnits);
  }

  static std::vector<Vad::IHdlNetListNode*> ChildrenOf(Vad::IHdlNetListNode* node) {
    std::vector<Vad::IHdlNetListNode*> children;
    Prjrep::AutoRelease<Vad::IHdlNetListNodeIterator> child;
    if (!node || node->GetChildren(child.Out()) != CitI::kOk) return children;
    for (; !child->IsDone(); child->Next()) children.push_back(child->Current());
    return children;
  }

  static std::string NameOf(Vad::IHdlNetListNode* node) {
    Port::StringBase name;
    Prjrep::QueryAs<Vad::IHdlNetListNodeInternal>(node)->GetName(&name);
    return name.str();
  }
  static std::string PathOf(Vad::IHdlNetListNode* node) {
    Port::StringBase path;
    Prjrep::QueryAs<UtilI::ITclCollectable>(node)->GetName(&path);
    return path.str();
  }

  // One line per node from `top` down in pre-order (without `top` when `withTop` is false),
  // indented two blanks per level: name [label] {Tcl path} Tcl type, then "@file" for a node with
  // element, "missing" for one without, and "cell" for a library cell. `distinct` gets every node.
  static std::string Render(Vad::IHdlNetListNode* top, bool withTop = true,
                            std::set<Vad::IHdlNetListNode*>* distinct = nullptr) {
    std::string text;
    std::vector<std::pair<Vad::IHdlNetListNode*, int>> pending{{top, withTop ? 0 : -1}};
    while (!pending.empty()) {
      auto [node, depth] = pending.back();
      pending.pop_back();
      if (distinct) distinct->insert(node);
      if (depth >= 0) text += std::string(static_cast<std::size_t>(2 * depth), ' ') + Line(node) + "\n";
      std::vector<Vad::IHdlNetListNode*> children = ChildrenOf(node);
      for (auto child = children.rbegin(); child != children.rend(); ++child)
        pending.emplace_back(*child, depth + 1);
    }
    return text;
  }
  static std::string RenderTree(Vad::IHdlNetListNode* root) { return Render(root, false); }

  Prjrep::AutoPtr<Vad::IHdlProject> project_;
  std::vector<Prjrep::AutoRelease<CitI::IInterface>> units_;

 private:
  static std::string Line(Vad::IHdlNetListNode* node) {
    Port::StringBase label;
    Port::StringBase type;
    node->GetInstanceName(&label);
    Prjrep::QueryAs<UtilI::ITclCollectable>(node)->GetType(&type);
    std::string line = NameOf(node) + " [" + label.str() + "] {" + PathOf(node) + "} " + type.str();
    line += node->GetElement() ? " @" + FileNameOf(node) : std::string(" missing");
    return line + (node->IsLibraryCell() ? " cell" : "");
  }
  static std::string FileNameOf(Vad::IHdlNetListNode* node) {
    Prjrep::AutoRelease<Vad::IHdlFile> file;
    if (node->GetElement()->GetFile(file.Out()) != CitI::kOk || !file) return {};
    Port::StringBase directory;
    Port::StringBase fileName;
    file->getFileName(&directory, &fileName);
    return fileName.str();
  }
};

}  // namespace elab_test
