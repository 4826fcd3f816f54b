// Netlist nodes and the tree building: faces, child and parent links, paths, partitions, the
// hierarchy of registered units, library cells, duplicate names and placeholder nodes.
#include <gtest/gtest.h>

#include "Arch.h"
#include "CLibRefs.h"
#include "CompInst.h"
#include "ElabFixtures.h"
#include "EntityDecl.h"
#include "IHdlDesignUnit.h"
#include "Prjrep/TSequenceSetHelper.h"
#include "Use.h"
#include "module.h"

using namespace elab_test;
using Port::StringBase;

namespace {

class NetListNode : public ElabTest {
 protected:
  void SetUp() override {
    ElabTest::SetUp();
    work_ = MakeFile("/src/work.vhd");
  }

  Prjrep::AutoPtr<Vad::IHdlNetListNode> Node(std::string_view name = {}, Vad::IHdlElement* element = nullptr,
                                             Vad::IHdlNetListNode* parent = nullptr) {
    Prjrep::AutoPtr<Vad::IHdlNetListNode> node;
    EXPECT_EQ(elaborator_->CreateNetListNode(StringBase(name), element, parent, node.Out()), CitI::kOk);
    return node;
  }
  static Vad::IHdlNetListNodeInternal* Internal(Vad::IHdlNetListNode* node) {
    return Prjrep::QueryAs<Vad::IHdlNetListNodeInternal>(node);
  }
  static Vad::CNetListNode* Object(Vad::IHdlNetListNode* node) {
    return Vad::CNetListNode::FromInterface(node);
  }

  Prjrep::AutoPtr<Vad::IHdlNetListNode> Elaborate(const std::vector<CitI::IInterface*>& units) {
    Prjrep::AutoPtr<Vad::IHdlNetListNode> root;
    EXPECT_EQ(elaborator_->Elaborate(References(), IterateUnits(units).Get(), root.Out()), CitI::kOk);
    return root;
  }

  Prjrep::AutoPtr<Vad::IHdlFile> work_;
  Prjrep::AutoRelease<Vad::CElaborator> elaborator_{new Vad::CElaborator()};
};

TEST_F(NetListNode, ChildrenAreOwnedAndParentLinksAreWeak) {
  auto parent = Node("parent");
  auto first = Node("first", nullptr, parent.Get());
  auto front = Node("front");
  EXPECT_EQ(Internal(parent.Get())->AddChildFirst(front.Get()), CitI::kOk);
  EXPECT_EQ(Internal(parent.Get())->AddChild(nullptr), CitI::kInvalidArg);
  EXPECT_EQ(Internal(parent.Get())->AddChildFirst(nullptr), CitI::kInvalidArg);

  auto children = ChildrenOf(parent.Get());
  ASSERT_EQ(children.size(), 2u);
  EXPECT_EQ(NameOf(children[0]), "front");
  EXPECT_EQ(NameOf(children[1]), "first");
  EXPECT_EQ(Prjrep::RefCountOf(first.Get()), 2u);
  EXPECT_EQ(Prjrep::RefCountOf(parent.Get()), 1u);

  Prjrep::AutoRelease<Vad::IHdlNetListNodeIterator> parents;
  ASSERT_EQ(first->GetParents(parents.Out()), CitI::kOk);
  ASSERT_FALSE(parents->IsDone());
  EXPECT_EQ(parents->Current(), parent.Get());
  parents = nullptr;

  // An iterator keeps its node alive; a child that outlives its parent loses the link.
  Prjrep::AutoRelease<Vad::IHdlNetListNodeIterator> iterator;
  ASSERT_EQ(parent->GetChildren(iterator.Out()), CitI::kOk);
  parent = nullptr;
  ASSERT_FALSE(iterator->IsDone());
  EXPECT_EQ(iterator->Current(), front.Get());
  iterator = nullptr;
  EXPECT_EQ(Prjrep::RefCountOf(first.Get()), 1u);
  EXPECT_EQ(Object(first.Get())->FirstParent(), nullptr);
}

TEST_F(NetListNode, NameFieldsComeFromTheBarSeparatedParts) {
  auto node = Node("work:Architecture|sub|rtl");
  Vad::CNetListNode* object = Object(node.Get());
  EXPECT_EQ(object->Kind(), "work:Architecture");
  EXPECT_EQ(object->UnitName(), "sub");
  EXPECT_EQ(object->ArchitectureName(), "rtl");
  Port::StringBase text;
  EXPECT_EQ(node->GetUnitName(&text), CitI::kOk);
  EXPECT_EQ(text, "sub");
  EXPECT_EQ(node->GetArchitectureName(&text), CitI::kOk);
  EXPECT_EQ(text, "rtl");
  EXPECT_EQ(Internal(node.Get())->GetKind(&text), CitI::kOk);
  EXPECT_EQ(text, "work:Architecture");
  EXPECT_EQ(node->GetInstanceName(nullptr), CitI::kInvalidArg);
  EXPECT_EQ(node->Reserved8(), CitI::kNotImpl);
  EXPECT_EQ(Vad::CNetListNode::FromInterface(work_.Get()), nullptr);
  // Missing parts leave the fields as they were; empty parts keep their places.
  ASSERT_EQ(elaborator_->SetNodeNameFields(node.Get(), "Entity"), CitI::kOk);
  EXPECT_EQ(object->Name(), "Entity");
  EXPECT_EQ(object->Kind(), "Entity");
  EXPECT_EQ(object->UnitName(), "sub");
  ASSERT_EQ(elaborator_->SetNodeNameFields(node.Get(), "Architecture||a"), CitI::kOk);
  EXPECT_EQ(object->UnitName(), "");
  EXPECT_EQ(object->ArchitectureName(), "a");
  EXPECT_EQ(elaborator_->SetNodeNameFields(nullptr, "x"), CitI::kInvalidArg);
  EXPECT_EQ(elaborator_->CreateNetListNode("x", nullptr, nullptr, nullptr), CitI::kInvalidArg);
}

TEST_F(NetListNode, PathsFollowInstanceLabelsFromTheTopUnits) {
  auto assoc = MakeFile("/src/assoc.x", "work", "PLUGIN_AssocModule");
  CitI::IInterface* assocModule = Unit<Vad::module>(assoc.Get(), "m", nullptr);
  CitI::IInterface* verilogModule = Unit<Vad::module>(work_.Get(), "v", nullptr);

  auto root = Node();
  auto arch = Node("Architecture|top|rtl", nullptr, root.Get());
  auto instance = Node("work:Architecture|sub|rtl", nullptr, arch.Get());
  Internal(instance.Get())->SetInstanceName("u1");
  auto deeper = Node("work:Architecture|leaf|rtl", nullptr, instance.Get());
  Internal(deeper.Get())->SetInstanceName("u2");
  auto entity = Node("work:Entity|top", nullptr, arch.Get());
  auto moduleNode = Node("Module|v", ElementOf(verilogModule), root.Get());
  auto assocTop = Node("Module|m", ElementOf(assocModule), root.Get());
  auto package = Node("PackageBody|p", nullptr, root.Get());
  Internal(root.Get())->ComputePaths("");

  auto pathAndType = [](Vad::IHdlNetListNode* node) {
    Port::StringBase type;
    Prjrep::QueryAs<UtilI::ITclCollectable>(node)->GetType(&type);
    return PathOf(node) + " " + type.str();
  };
  EXPECT_EQ(pathAndType(root.Get()), " ");
  EXPECT_EQ(pathAndType(arch.Get()), "/top instance");
  EXPECT_EQ(pathAndType(instance.Get()), "/top/u1 instance");
  EXPECT_EQ(pathAndType(deeper.Get()), "/top/u1/u2 instance");
  EXPECT_EQ(pathAndType(entity.Get()), " work:Entity");
  EXPECT_EQ(pathAndType(moduleNode.Get()), "/v instance");
  EXPECT_EQ(pathAndType(assocTop.Get()), "/m Module");
  EXPECT_EQ(pathAndType(package.Get()), " PackageBody");

  Port::StringBase id;
  auto* tcl = Prjrep::QueryAs<UtilI::ITclCollectable>(deeper.Get());
  ASSERT_EQ(tcl->GetCollectionId(&id), CitI::kOk);
  EXPECT_EQ(id, "netlistnode:/top/u1/u2");
  EXPECT_FALSE(tcl->Reserved5());
  EXPECT_FALSE(tcl->Reserved6());
  EXPECT_EQ(tcl->Reserved7(), CitI::kNotImpl);
  EXPECT_EQ(tcl->Reserved9(), CitI::kNotImpl);
  testing::internal::CaptureStdout();
  EXPECT_EQ(tcl->Print(), CitI::kOk);
  EXPECT_EQ(testing::internal::GetCapturedStdout(),
            "CNetListNode::ITclCollectable -> Name = /top/u1/u2 Type = instance\n");
}

TEST_F(NetListNode, PartitionAndGenerateFlagComeFromTheInstance) {
  CitI::IInterface* arch = Unit<Vad::Arch>(work_.Get(), "top", "rtl", nullptr);
  RecordOf<Vad::CHdlElement>(arch)->SetProperty("PARTITION", "unit_part");
  Vad::CompInst* instance = Component(arch, "u1", "sub");
  instance->SetProperty("PARTITION", "inst_part");
  instance->SetInGenerate(true);

  auto top = Node("Architecture|top|rtl", ElementOf(arch));
  auto child = Node("work:Architecture|sub|rtl", nullptr, top.Get());
  auto bare = Node("work:Architecture|x");
  Internal(child.Get())->SetInstanceElement(ElementOf(instance));

  auto partition = [](Vad::IHdlNetListNode* node, CitI::Result* result = nullptr) {
    Port::StringBase text = "stale";
    CitI::Result status = Prjrep::QueryAs<Vad::IHdlPartitionData>(node)->GetPartition(&text);
    if (result) *result = status;
    return text.str();
  };
  EXPECT_EQ(partition(top.Get()), "unit_part");
  EXPECT_EQ(partition(child.Get()), "inst_part");
  CitI::Result status = CitI::kOk;
  EXPECT_EQ(partition(bare.Get(), &status), "");
  EXPECT_EQ(status, CitI::kFail);
  bool isPartition = false;
  EXPECT_EQ(Prjrep::QueryAs<Vad::IHdlPartitionData>(child.Get())->IsPartition(&isPartition), CitI::kOk);
  EXPECT_TRUE(isPartition);
  EXPECT_EQ(Prjrep::QueryAs<Vad::IHdlPartitionData>(bare.Get())->IsPartition(&isPartition), CitI::kOk);
  EXPECT_FALSE(isPartition);

  bool inGenerate = false;
  EXPECT_EQ(Prjrep::QueryAs<Vad::IInstanceData>(child.Get())->GetInGenerate(&inGenerate), CitI::kOk);
  EXPECT_TRUE(inGenerate);
  inGenerate = true;
  EXPECT_EQ(Prjrep::QueryAs<Vad::IInstanceData>(top.Get())->GetInGenerate(&inGenerate), CitI::kFail);
  EXPECT_FALSE(inGenerate);
}

TEST_F(NetListNode, ArchitectureIsTheTopNodeOfItsEntity) {
  CitI::IInterface* entity = Unit<Vad::EntityDecl>(work_.Get(), "e", nullptr);
  CitI::IInterface* arch = Unit<Vad::Arch>(work_.Get(), "e", "rtl", nullptr);
  auto root = Elaborate({entity, arch});
  EXPECT_EQ(RenderTree(root.Get()),
            "Architecture|e|rtl [] {/e} instance @work.vhd\n"
            "  work:Entity|e [] {} work:Entity @work.vhd\n");
}

TEST_F(NetListNode, UnitReachedTwiceShowsItsInstancesUnderBothParents) {
  CitI::IInterface* top = Unit<Vad::Arch>(work_.Get(), "top", "rtl", nullptr);
  CitI::IInterface* mid = Unit<Vad::Arch>(work_.Get(), "mid", "rtl", nullptr);
  CitI::IInterface* leaf = Unit<Vad::module>(work_.Get(), "leaf", nullptr);
  Component(top, "a", "mid");
  Component(top, "b", "mid");
  Component(mid, "l", "leaf");
  auto root = Elaborate({top, mid, leaf});
  EXPECT_EQ(RenderTree(root.Get()),
            "Architecture|top|rtl [] {/top} instance @work.vhd\n"
            "  work:Architecture|mid|rtl [a] {/top/a} instance @work.vhd\n"
            "    work:Module|leaf [l] {/top/a/l} instance @work.vhd\n"
            "    work:Entity|mid [] {} work:Entity missing\n"
            "  work:Architecture|mid|rtl [b] {/top/b} instance @work.vhd\n"
            "    work:Module|leaf [l] {/top/b/l} instance @work.vhd\n"
            "    work:Entity|mid [] {} work:Entity missing\n"
            "  work:Entity|top [] {} work:Entity missing\n");
  // Each node of the instance knows the record that made it.
  auto mids = ChildrenOf(ChildrenOf(root.Get())[0]);
  auto* first = Object(ChildrenOf(mids[0])[0]);
  auto* second = Object(ChildrenOf(mids[1])[0]);
  ASSERT_NE(first->GetInstanceElement(), nullptr);
  EXPECT_EQ(first->GetInstanceElement(), second->GetInstanceElement());
  EXPECT_NE(Object(mids[0])->GetInstanceElement(), Object(mids[1])->GetInstanceElement());
}

TEST_F(NetListNode, MissingUnitOfATopNodeOutsideWorkKnowsItsInstance) {
  auto lib2 = MakeFile("/src/lib2.vhd", "lib2");
  CitI::IInterface* top = Unit<Vad::Arch>(lib2.Get(), "top", "rtl", nullptr);
  Vad::CompInst* made = Component(top, "u_ghost", "ghost");
  made->SetProperty("PARTITION", "part_g");
  auto root = Elaborate({top});
  auto ghost = ChildrenOf(ChildrenOf(root.Get())[0])[0];
  EXPECT_EQ(NameOf(ghost), "lib2:Architecture|ghost");
  EXPECT_EQ(Object(ghost)->GetInstanceElement(), ElementOf(made));
  Port::StringBase partition;
  EXPECT_EQ(Prjrep::QueryAs<Vad::IHdlPartitionData>(ghost)->GetPartition(&partition), CitI::kOk);
  EXPECT_EQ(partition, "part_g");
}

TEST_F(NetListNode, UnitReachingItselfIsCutWithAWarning) {
  Vad::CElabTables tables;
  tables.m_DependsTable[StringBase("work:A")] = {"work:B"};
  tables.m_DependsTable[StringBase("work:B")] = {"work:A"};
  Vad::VisitedMap visited;
  Vad::MissingNodeList missing;
  auto node = Node("A");
  StringBase path;
  MessageLog messages;
  EXPECT_EQ(elaborator_->BuildSubtree(tables, visited, missing, node.Get(), "work:A", path), CitI::kOk);
  EXPECT_EQ(path, "");
  EXPECT_EQ(Render(node.Get()),
            "A [] {}  missing\n"
            "  work:B [] {}  missing\n"
            "    work:A [] {}  missing\n");
  StringBase expected;
  expected.Format(Vad::ElabText::kCircularReference, "work:A");
  EXPECT_EQ(messages.Texts(Port_MsgMan::kWarning), std::vector<std::string>{expected.str()});
  EXPECT_EQ(missing.size(), 2u);
  EXPECT_TRUE(visited[StringBase("work:B")]);

  // A path that already holds the unit is cut at once.
  path = "|*work:A|";
  EXPECT_EQ(elaborator_->BuildSubtree(tables, visited, missing, node.Get(), "work:A", path), CitI::kFail);
  EXPECT_EQ(elaborator_->BuildSubtree(tables, visited, missing, nullptr, "work:A", path), CitI::kInvalidArg);
}

TEST_F(NetListNode, DuplicateSuffixLeavesOnlyTheTopNodes) {
  CitI::IInterface* duplicate = Unit<Vad::EntityDecl>(work_.Get(), "dup", nullptr);
  const char* suffixed = "Entity|dup****DUPLICATE_1_DUPLICATE****|x";
  auto root = Node();
  auto top = Node(suffixed, ElementOf(duplicate), root.Get());
  auto deeper = Node(suffixed, ElementOf(duplicate), top.Get());
  auto other = Node("Entity|other****DUPLICATE_2_DUPLICATE****", nullptr, root.Get());
  ASSERT_EQ(elaborator_->StripDuplicateSuffixes({ElementOf(duplicate)}, root.Get()), CitI::kOk);
  EXPECT_EQ(NameOf(top.Get()), "Entity|dup|x");
  EXPECT_EQ(Object(top.Get())->UnitName(), "dup");
  EXPECT_EQ(Object(top.Get())->ArchitectureName(), "x");
  EXPECT_EQ(NameOf(deeper.Get()), suffixed);
  EXPECT_EQ(NameOf(other.Get()), "Entity|other****DUPLICATE_2_DUPLICATE****");
}

TEST_F(NetListNode, LibraryCellsAreFoundInTheCellLibrariesAndThroughUseClauses) {
  Vad::CLibRefs* references = References();
  ASSERT_NE(references, nullptr);
  references->AddLibraryUnit("mylib", "cells", "MY_CELL");
  CitI::IInterface* arch = Unit<Vad::Arch>(work_.Get(), "top", "rtl", nullptr);
  CitI::IInterface* entity = Unit<Vad::EntityDecl>(work_.Get(), "top", nullptr);
  CitI::IInterface* verilog = Unit<Vad::module>(work_.Get(), "vtop", nullptr);

  auto parent = Node("Architecture|top|rtl", ElementOf(arch));
  auto cell = Node("work:Architecture|QL_INV", nullptr, parent.Get());
  auto lowerCell = Node("work:Architecture|ql_inv", nullptr, parent.Get());
  auto named = Node("work:Architecture|basecell.QL_INV", nullptr, parent.Get());
  auto mine = Node("work:Architecture|MY_CELL", nullptr, parent.Get());
  auto ghost = Node("work:Architecture|ghost", nullptr, parent.Get());
  auto orphan = Node("work:Architecture|QL_INV");
  auto verilogParent = Node("Module|vtop", ElementOf(verilog));
  auto verilogCell = Node("work:Architecture|QL_INV", nullptr, verilogParent.Get());

  Vad::CElabTables tables;
  auto isCell = [&](Vad::IHdlNetListNode* node) {
    bool answer = true;
    EXPECT_EQ(elaborator_->TestLibraryCell(tables, references, node, &answer), CitI::kOk);
    return answer;
  };
  EXPECT_TRUE(isCell(cell.Get()));
  EXPECT_TRUE(isCell(lowerCell.Get()));
  EXPECT_TRUE(isCell(verilogCell.Get()));
  EXPECT_FALSE(isCell(named.Get()));
  EXPECT_FALSE(isCell(ghost.Get()));
  EXPECT_FALSE(isCell(orphan.Get()));
  EXPECT_FALSE(isCell(mine.Get()));

  // A package named by a use clause of the architecture, or of its entity below it.
  Uses(entity, "mylib.cells.all");
  auto entityNode = Node("work:Entity|top", ElementOf(entity), parent.Get());
  EXPECT_TRUE(isCell(mine.Get()));
  RecordOf<Vad::CVhdlDU>(entity)->SetUses({});
  EXPECT_FALSE(isCell(mine.Get()));
  Uses(arch, "mylib.cells.all");
  EXPECT_TRUE(isCell(mine.Get()));

  bool answer = false;
  EXPECT_EQ(elaborator_->TestLibraryCell(tables, references, cell.Get(), nullptr), CitI::kInvalidArg);
  EXPECT_EQ(elaborator_->TestLibraryCell(tables, nullptr, cell.Get(), &answer), CitI::kOk);
  EXPECT_FALSE(answer);
}

TEST_F(NetListNode, DumpShowsEachNodeIndentedByDepth) {
  CitI::IInterface* arch = Unit<Vad::Arch>(work_.Get(), "top", "rtl", nullptr);
  RecordOf<Vad::CHdlElement>(arch)->SetProperty("PARTITION", "p0");
  auto top = Node("Architecture|top|rtl", ElementOf(arch));
  Internal(Node("work:Architecture|sub|fast", nullptr, top.Get()).Get())->SetInstanceName("u1");
  testing::internal::CaptureStdout();
  EXPECT_EQ(elaborator_->DumpTree(top.Get(), 0), CitI::kOk);
  std::string dump = testing::internal::GetCapturedStdout();
  for (const char* entry : {"Module Name      : top\n", "Partition: p0\nFile             : /src/work.vhd\n",
                            "|  Instance Name    : u1\n|  Module Name      : sub\n"})
    EXPECT_NE(dump.find(entry), std::string::npos) << entry;
  EXPECT_EQ(elaborator_->DumpTree(nullptr, 0), CitI::kInvalidArg);
}

TEST_F(NetListNode, FilesWithoutUnitsGetPlaceholdersInFrontInDescendingOrderKey) {
  Prjrep::AutoPtr<Vad::IHdlFileSet> files(Prjrep::TRefdSequenceSetHelper<Vad::IHdlFileSet>::New().Get());
  auto vhdl = MakeFile("/src/a.vhd", "work", "PLUGIN_Vhdl", 5);
  auto verilog = MakeFile("/src/b.v", "work", "PLUGIN_Verilog", 9);
  auto later = MakeFile("/src/c.vhd", "work", "PLUGIN_Vhdl", 1);
  auto prefixed = MakeFile("/src/d.vhd", "work", "PLUGIN_Vhdl2", 3);
  auto general = MakeFile("/src/e.txt", "work", "PLUGIN_Generic", 4);
  for (auto* file : {vhdl.Get(), verilog.Get(), later.Get(), prefixed.Get(), general.Get()}) files->Add(file);
  Prjrep::AutoRelease<Vad::IHdlFileIterator> iterator;
  ASSERT_EQ(files->CreateIterator(iterator.Out()), CitI::kOk);

  auto root = Node();
  auto existing = Node("Architecture|top|rtl", nullptr, root.Get());
  ASSERT_EQ(elaborator_->AddMissingFileNodes(root.Get(), iterator.Get()), CitI::kOk);
  EXPECT_EQ(RenderTree(root.Get()),
            "Module| [] {}  @b.v\n"
            "Module| [] {}  @a.vhd\n"
            "Module| [] {}  @c.vhd\n"
            "Architecture|top|rtl [] {}  missing\n");
  auto* placeholder = RecordOf<Vad::module>(ChildrenOf(root.Get())[0]->GetElement());
  ASSERT_NE(placeholder, nullptr);
  EXPECT_EQ(placeholder->GetType(), Vad::DbType::kModule);
  EXPECT_EQ(placeholder->GetKey(), "Module|");
  EXPECT_EQ(Object(ChildrenOf(root.Get())[0])->Kind(), "Module");

  EXPECT_EQ(elaborator_->AddMissingFileNodes(nullptr, nullptr), CitI::kInvalidArg);
  EXPECT_EQ(elaborator_->AddMissingFileNodes(nullptr, iterator.Get()), CitI::kInvalidArg);
  EXPECT_EQ(elaborator_->AddMissingFileNodes(root.Get(), nullptr), CitI::kOk);
  EXPECT_EQ(ChildrenOf(root.Get()).size(), 4u);
}

}  // namespace
