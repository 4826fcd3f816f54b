// Shared set-up of the elaboration tests: host components and module factories in the registry,
// projects and files made the way a host makes them, design-unit records made by hand, and a
// text rendering of hierarchy trees.
#pragma once

#include <gtest/gtest.h>

#include <cstdlib>
#include <string>
#include <string_view>
#include <vector>

#include "CElaborator.h"
#include "CHdlElement.h"
#include "CHdlFile.h"
#include "CHdlProject.h"
#include "CNetListNode.h"
#include "HdlSets.h"
#include "Host/FileType.h"
#include "Host/HostComponents.h"
#include "Host/SourceLibrary.h"
#include "ICompAdmin.h"
#include "IHdlElaborationData.h"
#include "IHdlFile.h"
#include "IHdlNetListNode.h"
#include "IHdlProject.h"
#include "ISourceLibraryMember.h"
#include "ITclCollectable.h"
#include "Identifiers.h"
#include "Port/MsgCollector.h"
#include "Port/MsgDispatcher.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/Casts.h"
#include "Prjrep/TListIter.h"

extern "C" void InstFactoryEntry();

namespace elab_test {

inline std::string DataPath(std::string_view relative) {
  return std::string(QUILLON_TEST_DATA_DIR) + "/elab/" + std::string(relative);
}

// Gathers the messages issued while it lives.
class MessageLog {
 public:
  MessageLog() { Port_MsgDispatcher::addMsgMan(&collector_); }
  ~MessageLog() { Port_MsgDispatcher::removeMsgMan(&collector_); }
  MessageLog(const MessageLog&) = delete;
  MessageLog& operator=(const MessageLog&) = delete;

  const std::vector<Port_MsgRecord>& Records() const { return collector_.records(); }
  std::vector<std::string> Texts(Port_MsgMan::MsgType type) const {
    std::vector<std::string> texts;
    for (const Port_MsgRecord& record : Records()) {
      if (record.type == type) texts.push_back(record.text);
    }
    return texts;
  }

 private:
  Port_MsgCollector collector_;
};

class ElabTest : public testing::Test {
 protected:
  static void SetUpTestSuite() {
    ASSERT_TRUE(Host::RegisterHostComponents());
    InstFactoryEntry();
    // The cell libraries of the repository's data folder stand in for an installation.
    setenv("CORVANE", (std::string(QUILLON_TEST_DATA_DIR) + "/../../data").c_str(), 0);
  }

  static Prjrep::AutoPtr<Vad::IHdlProject> NewProject() {
    auto project = Prjrep::CreateInstanceAs<Vad::IHdlProject>(Vad::ClassIds::CHdlProject());
    EXPECT_TRUE(project);
    return project;
  }

  // A file as a host makes one, in `library`, added to the project.
  static Prjrep::AutoPtr<Vad::IHdlFile> AddFile(Vad::IHdlProject* project, std::string_view path,
                                                std::string_view library = "work",
                                                std::string_view plugin = "PLUGIN_Vhdl",
                                                std::uint64_t orderKey = 0) {
    Prjrep::AutoPtr<Vad::IHdlFile> file = NewFile(project, path, library, plugin, orderKey);
    EXPECT_EQ(Prjrep::QueryAs<Vad::IHdlFileSet>(project)->Add(file.Get()), CitI::kOk);
    return file;
  }

  static Prjrep::AutoPtr<Vad::IHdlFile> NewFile(Vad::IHdlProject* project, std::string_view path,
                                                std::string_view library = "work",
                                                std::string_view plugin = "PLUGIN_Vhdl",
                                                std::uint64_t orderKey = 0) {
    Prjrep::AutoPtr<Vad::IHdlFile> file;
    EXPECT_EQ(project->createNewFile(file.Out()), CitI::kOk);
    auto fileType = Host::FileType::Create("HDL", {"vhd", "v"});
    EXPECT_EQ(Prjrep::QueryAs<Vad::ICompAdmin>(file.Get())->InitializeAfterCreate(nullptr, fileType.Get()),
              CitI::kOk);
    EXPECT_EQ(file->setFilePath(Port::StringBase(path), Port::StringBase()), CitI::kOk);
    file->setPluginName(Port::StringBase(plugin));
    file->setOrderKey(orderKey);
    auto* member = Prjrep::QueryAs<Vad::ISourceLibraryMember>(file.Get());
    EXPECT_EQ(member->setSourceLibrary(Host::SourceLibrary::Create(library).Get()), CitI::kOk);
    return file;
  }

  static Prjrep::AutoPtr<Vad::IHdlNetListNode> HierarchyRoot(Vad::IHdlProject* project,
                                                             CitI::Result expected = CitI::kOk) {
    Prjrep::AutoPtr<Vad::IHdlNetListNode> root;
    auto* data = Prjrep::QueryAs<Vad::IHdlElaborationData>(project);
    EXPECT_EQ(data->getHierarchyRoot(root.Out()), expected);
    return root;
  }

  static Vad::CHdlProject* ProjectObject(Vad::IHdlProject* project) {
    return Prjrep::ObjectCast<Vad::CHdlProject>(project);
  }

  // A record made by hand, linked to `file` (for its library), with the creation reference
  // owned by the returned pointer.
  template <class Record, class... Args>
  static Prjrep::AutoRelease<CitI::IInterface> MakeUnit(Vad::IHdlFile* file, Args&&... args) {
    auto* record = new Record(std::forward<Args>(args)...);
    record->SetFile(file);
    return Prjrep::AutoRelease<CitI::IInterface>(record);
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

  // The file name of the node's element, or empty.
  static std::string FileNameOf(Vad::IHdlNetListNode* node) {
    Prjrep::AutoRelease<Vad::IHdlFile> file;
    if (!node->GetElement() || node->GetElement()->GetFile(file.Out()) != CitI::kOk || !file) return {};
    Port::StringBase directory;
    Port::StringBase fileName;
    file->getFileName(&directory, &fileName);
    return fileName.str();
  }

  // One line per node, indented two blanks per level:
  //   name [label] {Tcl path} Tcl type, then "@file" for a node with element, "missing" for one
  //   without, and "cell" for a library cell.
  static std::string Render(Vad::IHdlNetListNode* node, int depth = 0) {
    Port::StringBase label;
    Port::StringBase path;
    Port::StringBase type;
    node->GetInstanceName(&label);
    auto* tcl = Prjrep::QueryAs<UtilI::ITclCollectable>(node);
    tcl->GetName(&path);
    tcl->GetType(&type);
    std::string line(static_cast<std::size_t>(2 * depth), ' ');
    line += NameOf(node) + " [" + label.str() + "] {" + path.str() + "} " + type.str();
    line += node->GetElement() ? " @" + FileNameOf(node) : std::string(" missing");
    if (node->IsLibraryCell()) line += " cell";
    line += "\n";
    for (Vad::IHdlNetListNode* child : ChildrenOf(node)) line += Render(child, depth + 1);
    return line;
  }

  // The children of the root, rendered.
  static std::string RenderTree(Vad::IHdlNetListNode* root) {
    std::string text;
    for (Vad::IHdlNetListNode* child : ChildrenOf(root)) text += Render(child);
    return text;
  }
};

}  // namespace elab_test
