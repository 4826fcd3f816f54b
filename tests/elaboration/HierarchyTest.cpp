// The whole road through the registry: a project of VHDL files, its design units, the
// elaborator and the hierarchy tree the host receives.
#include <gtest/gtest.h>

#include "CHdlProject.h"
#include "ElabFixtures.h"
#include "IHdlDesignUnit.h"
#include "Port/MsgManData.h"

using namespace elab_test;

namespace {

class Hierarchy : public ElabTest {};

TEST_F(Hierarchy, ThreeLevelProjectWithPackagesInTwoLibraries) {
  AddFile(DataPath("three_level/util_pkg.vhd"), "util");
  for (const char* name : {"types_pkg.vhd", "leaf.vhd", "mid.vhd", "top.vhd"})
    AddFile(DataPath("three_level/") + name);
  AddFile(DataPath("three_level/empty.vhd"), "work", "PLUGIN_Vhdl", 7);
  AddFile(DataPath("three_level/context_only.vhd"), "work", "PLUGIN_Vhdl", 3);
  MessageLog messages;
  auto root = HierarchyRoot();
  ASSERT_TRUE(root);

  // The cell instance is no missing unit: either the parse already knew it as a library cell or
  // its node carries the flag.
  std::string tree = RenderTree(root.Get());
  std::string cellLine = "  work:Architecture|QL_INV [u_cell] {/top/u_cell} instance missing cell\n";
  if (auto at = tree.find(cellLine); at != std::string::npos) tree.erase(at, cellLine.size());
  EXPECT_EQ(tree,
            "Module| [] {}  @empty.vhd\n"
            "Module| [] {}  @context_only.vhd\n"
            "PackageBody|util_pkg [] {} PackageBody @util_pkg.vhd\n"
            "  util:PackageDecl|util_pkg [] {} util:PackageDecl @util_pkg.vhd\n"
            "Architecture|top|rtl [] {/top} instance @top.vhd\n"
            "  work:Architecture|mid|rtl [u_mid] {/top/u_mid} instance @mid.vhd\n"
            "    work:Architecture|leaf|rtl [u_leaf] {/top/u_mid/u_leaf} instance @leaf.vhd\n"
            "      work:Entity|leaf [] {} work:Entity @leaf.vhd\n"
            "        util:PackageDecl|util_pkg [] {} util:PackageDecl @util_pkg.vhd\n"
            "    work:Architecture|leaf|rtl [u_leaf2] {/top/u_mid/u_leaf2} instance @leaf.vhd\n"
            "      work:Entity|leaf [] {} work:Entity @leaf.vhd\n"
            "        util:PackageDecl|util_pkg [] {} util:PackageDecl @util_pkg.vhd\n"
            "    work:Entity|mid [] {} work:Entity @mid.vhd\n"
            "      work:PackageDecl|types_pkg [] {} work:PackageDecl @types_pkg.vhd\n"
            "  work:Architecture|ghost [u_ghost] {/top/u_ghost} instance missing\n"
            "  work:Entity|top [] {} work:Entity @top.vhd\n");
  EXPECT_TRUE(messages.Texts(Port_MsgMan::kWarning).empty());
  EXPECT_TRUE(messages.Texts(Port_MsgMan::kError).empty());
}

TEST_F(Hierarchy, DuplicateEntityIsATopNodeUnderItsPlainName) {
  AddFile(DataPath("duplicate/dup_a.vhd"));
  AddFile(DataPath("duplicate/dup_b.vhd"));
  MessageLog messages;
  auto root = HierarchyRoot();
  ASSERT_TRUE(root);
  // Both architectures refer to the entity registered first; the second entity is referred to by
  // nothing and keeps only its own name once the suffix is gone.
  EXPECT_EQ(RenderTree(root.Get()),
            "Architecture|dup|a [] {/dup} instance @dup_a.vhd\n"
            "  work:Entity|dup [] {} work:Entity @dup_a.vhd\n"
            "Architecture|dup|b [] {/dup} instance @dup_b.vhd\n"
            "  work:Entity|dup [] {} work:Entity @dup_a.vhd\n"
            "Entity|dup [] {} Entity @dup_b.vhd\n");
  Port::StringBase unit;
  ChildrenOf(root.Get())[2]->GetUnitName(&unit);
  EXPECT_EQ(unit, "dup");
  EXPECT_TRUE(messages.Records().empty());
}

TEST_F(Hierarchy, UnitsThatInstantiateEachOtherAreCutWithAWarning) {
  AddFile(DataPath("cycle/ping.vhd"));
  AddFile(DataPath("cycle/pong.vhd"));
  MessageLog messages;
  auto root = HierarchyRoot();
  ASSERT_TRUE(root);
  // Every unit is referred to once; the first name in byte order becomes the top node.
  EXPECT_EQ(RenderTree(root.Get()),
            "Architecture|ping|rtl [] {/ping} instance @ping.vhd\n"
            "  work:Architecture|pong|rtl [u_pong] {/ping/u_pong} instance @pong.vhd\n"
            "    work:Architecture|ping|rtl [u_ping] {/ping/u_pong/u_ping} instance @ping.vhd\n"
            "    work:Entity|pong [] {} work:Entity @pong.vhd\n"
            "  work:Entity|ping [] {} work:Entity @ping.vhd\n");
  Port::StringBase expected;
  expected.Format(Vad::ElabText::kCircularReference, "work:Architecture|ping|rtl");
  EXPECT_EQ(messages.Texts(Port_MsgMan::kWarning), std::vector<std::string>{expected.str()});
  ASSERT_EQ(messages.Records().size(), 1u);
  EXPECT_EQ(messages.Records()[0].category, "ProjectMgmt");
  EXPECT_EQ(messages.Records()[0].sourceFile, "../src/CElaborator");
}

TEST_F(Hierarchy, ProjectWithoutFilesHasAnEmptyRoot) {
  auto root = HierarchyRoot();
  ASSERT_TRUE(root);
  EXPECT_TRUE(ChildrenOf(root.Get()).empty());
  EXPECT_EQ(root->GetElement(), nullptr);
  EXPECT_EQ(NameOf(root.Get()), "");
}

TEST_F(Hierarchy, CachedTreeIsKeptUntilTheFilesChange) {
  AddFile(DataPath("duplicate/dup_a.vhd"));
  auto first = HierarchyRoot();
  auto second = HierarchyRoot();
  EXPECT_EQ(first.Get(), second.Get());

  // Clearing the file set alone keeps the tree.
  ASSERT_EQ(Prjrep::QueryAs<Vad::IHdlFileSet>(project_.Get())->Clear(), CitI::kOk);
  EXPECT_EQ(HierarchyRoot().Get(), first.Get());

  AddFile(DataPath("duplicate/dup_b.vhd"));
  auto rebuilt = HierarchyRoot();
  EXPECT_NE(rebuilt.Get(), first.Get());
  EXPECT_EQ(ChildrenOf(rebuilt.Get()).size(), 1u);

  // A file that needs a parse again makes the tree out of date.
  auto again = HierarchyRoot();
  EXPECT_EQ(again.Get(), rebuilt.Get());
  auto units = ChildrenOf(again.Get());
  ASSERT_FALSE(units.empty());
  Prjrep::AutoRelease<Vad::IHdlFile> unitFile;
  units[0]->GetElement()->GetFile(unitFile.Out());
  ASSERT_TRUE(unitFile);
  unitFile->setNeedsParse(true);
  EXPECT_NE(HierarchyRoot().Get(), again.Get());
}

// Asks the project for its hierarchy from inside the message system, that is from inside a
// rebuild, and remembers what it got.
class NestedRequest : public Port_MsgCollector {
 public:
  explicit NestedRequest(Vad::IHdlProject* project) : project_(project) {}
  void onMessage(const Port_MsgRecord& record) override {
    Port_MsgCollector::onMessage(record);
    auto* data = Prjrep::QueryAs<Vad::IHdlElaborationData>(project_);
    Prjrep::AutoPtr<Vad::IHdlNetListNode> node;
    results.push_back(data->getHierarchyRoot(node.Out()));
    seen.push_back(node);
  }
  std::vector<CitI::Result> results;
  std::vector<Prjrep::AutoPtr<Vad::IHdlNetListNode>> seen;

 private:
  Vad::IHdlProject* project_;
};

TEST_F(Hierarchy, RequestDuringARebuildGetsThePreviousTreeWithoutRebuilding) {
  auto ping = AddFile(DataPath("cycle/ping.vhd"));
  AddFile(DataPath("cycle/pong.vhd"));
  NestedRequest nested(project_.Get());
  ASSERT_TRUE(Port_MsgDispatcher::addMsgMan(&nested));

  // First build: there is no previous tree, so the nested request gets an empty node.
  auto first = HierarchyRoot();
  ASSERT_EQ(nested.seen.size(), 1u);
  EXPECT_EQ(nested.results[0], CitI::kOk);
  ASSERT_TRUE(nested.seen[0]);
  EXPECT_NE(nested.seen[0].Get(), first.Get());
  EXPECT_TRUE(ChildrenOf(nested.seen[0].Get()).empty());

  // A rebuild of a tree gone out of date: the nested request sees the tree being replaced.
  ping->setNeedsParse(true);
  auto second = HierarchyRoot();
  Port_MsgDispatcher::removeMsgMan(&nested);
  ASSERT_EQ(nested.seen.size(), 2u);
  EXPECT_EQ(nested.seen[1].Get(), first.Get());
  EXPECT_NE(second.Get(), first.Get());
  nested.seen.clear();
}

TEST_F(Hierarchy, DesignUnitPortsAreAskedOfTheElement) {
  AddFile(DataPath("three_level/leaf.vhd"));
  auto root = HierarchyRoot();
  ASSERT_TRUE(root);
  auto* data = Prjrep::QueryAs<Vad::IHdlElaborationData>(project_.Get());
  auto* unit = Prjrep::QueryAs<Vad::IHdlDesignUnit>(ChildrenOf(root.Get())[0]->GetElement());
  ASSERT_NE(unit, nullptr);
  EXPECT_EQ(data->getDesignUnitPorts(unit, nullptr), CitI::kInvalidArg);
  EXPECT_EQ(data->getDesignUnitPorts(nullptr, nullptr), CitI::kInvalidArg);
  Vad::IHdlPortIterator* ports = nullptr;
  test_host::ForeignUnit foreign;
  EXPECT_EQ(data->getDesignUnitPorts(&foreign, &ports), CitI::kInvalidArg);
  EXPECT_EQ(ports, nullptr);
}

TEST_F(Hierarchy, ElaboratorIsMadeOnceAndKept) {
  Vad::CHdlProject* project = ProjectObject();
  EXPECT_EQ(project->getElaborator(nullptr), CitI::kInvalidArg);
  Prjrep::AutoRelease<Vad::CElaborator> first;
  Prjrep::AutoRelease<Vad::CElaborator> second;
  ASSERT_EQ(project->getElaborator(first.Out()), CitI::kOk);
  ASSERT_EQ(project->getElaborator(second.Out()), CitI::kOk);
  EXPECT_EQ(first.Get(), second.Get());
  EXPECT_EQ(Prjrep::RefCountOf(first.Get()), 3u);
}

}  // namespace
