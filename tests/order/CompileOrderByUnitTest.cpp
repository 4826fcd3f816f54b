// Compile orders for one design unit (getCompileOrderByDU) and below a chosen top node, on the
// "units" fixture:
//   top.vhd      entity top, architecture of top instantiating mid
//   mid.vhd      entity mid, architecture of mid using package util; entity side, architecture
//                of side instantiating leaf (nothing instantiates side)
//   util.vhd     package util
//   leaf_ent.vhd entity leaf using util;  leaf_rtl.vhd its architecture
//   other.vhd    an unrelated entity and architecture
//   orphan.vhd   an architecture of an entity that no file declares
//   counter.sm   a module (single-module plug-in);  notes.txt a generic text file
#include <gtest/gtest.h>

#include "NetListWalk.h"
#include "OrderFixtures.h"
#include "Port/MsgManData.h"

using namespace order_test;

namespace {

constexpr CitI::Result kNotOrderedByKind = 4;
constexpr CitI::Result kUnitNotInTree = 5;

class CompileOrderByUnit : public OrderTest {
 protected:
  void SetUp() override {
    OrderTest::SetUp();
    AddFiles("units",
             {"top.vhd", "mid.vhd", "util.vhd", "leaf_ent.vhd", "leaf_rtl.vhd", "other.vhd", "orphan.vhd"});
    AddFile("units", "counter.sm", "PLUGIN_SingleModule");
    notes_ = AddFile("units", "notes.txt", "PLUGIN_General");
    root_ = Root();
  }

  Strings OrderOf(std::string_view key, bool byUnit, CitI::Result expected = CitI::kOk) {
    auto unit = Unit(key);
    Prjrep::AutoPtr<Vad::IHdlFileIterator> order;
    EXPECT_EQ(Elaboration()->getCompileOrderByDU(unit.Get(), byUnit, order.Out()), expected) << key;
    if (expected != CitI::kOk) {
      EXPECT_FALSE(order) << key;
    }
    return FileNames(order.Get());
  }

  CitI::Result ResultFor(Vad::IHdlDesignUnit* unit, bool byUnit) {
    Prjrep::AutoPtr<Vad::IHdlFileIterator> order;
    CitI::Result result = Elaboration()->getCompileOrderByDU(unit, byUnit, order.Out());
    EXPECT_FALSE(order);
    return result;
  }

  Prjrep::AutoPtr<Vad::IHdlFile> notes_;
  Prjrep::AutoPtr<Vad::IHdlNetListNode> root_;
};

const Strings kWholeProject{"util.vhd", "leaf_ent.vhd", "leaf_rtl.vhd", "mid.vhd",
                            "top.vhd",  "other.vhd",    "orphan.vhd",   "counter.sm"};
// mid's tree (mid.vhd, util.vhd) widened by side, which shares mid.vhd, and side's subtree.
const Strings kMidWithItsFileMates{"util.vhd", "leaf_ent.vhd", "leaf_rtl.vhd", "mid.vhd"};

TEST_F(CompileOrderByUnit, EachUnitGetsTheOrderOfItsTreeByItselfOrWithItsDependencies) {
  struct Case {
    const char* key;
    bool byUnit;
    Strings order;
  };
  const Case cases[] = {
      {"Module|counter", true, {"counter.sm"}},
      {"Module|counter", false, {"counter.sm"}},
      {"Entity|top", true, kWholeProject},
      // An architecture by itself: not its own file, but its entity node's tree (the entity and the
      // package it uses).
      {"Architecture|leaf|rtl", true, {"util.vhd", "leaf_ent.vhd"}},
      {"Architecture|mid|rtl", true, {"mid.vhd"}},
      {"Architecture|ghost|rtl", false, {"orphan.vhd"}},
      {"PackageDecl|util", false, {"util.vhd"}},
      // With its dependencies, a unit takes along the units that share its files.
      {"Architecture|mid|rtl", false, kMidWithItsFileMates},
      {"Entity|side", false, kMidWithItsFileMates},
      {"Architecture|top|rtl", false, {"util.vhd", "leaf_ent.vhd", "leaf_rtl.vhd", "mid.vhd", "top.vhd"}},
      {"Architecture|other|rtl", false, {"other.vhd"}}};
  for (const Case& c : cases)
    EXPECT_EQ(OrderOf(c.key, c.byUnit), c.order) << c.key << " by unit " << c.byUnit;
  EXPECT_EQ(Messages(), Strings{});
  // By itself, an architecture without an entity in the project is in no tree, and a package is
  // not ordered.
  OrderOf("Architecture|ghost|rtl", true, kUnitNotInTree);
  OrderOf("PackageDecl|util", true, kNotOrderedByKind);
}

TEST_F(CompileOrderByUnit, AUnitOutsideTheTreeHasNoOrder) {
  // Generic units take no part in elaboration.
  Prjrep::AutoRelease<Vad::IHdlDesignUnitIterator> units;
  ASSERT_EQ(notes_->getDesignUnits(nullptr, units.Out()), CitI::kOk);
  ASSERT_FALSE(units->IsDone());
  Prjrep::AutoPtr<Vad::IHdlDesignUnit> generic(units->Current());
  ASSERT_EQ(Prjrep::ImplementationCast<Vad::DbObject>(generic.Get())->GetType(), Vad::DbType::kGeneric);
  EXPECT_EQ(ResultFor(generic.Get(), true), kUnitNotInTree);
  EXPECT_EQ(ResultFor(generic.Get(), false), kUnitNotInTree);
}

TEST_F(CompileOrderByUnit, ATopNodeGivenToTheProjectOrderGetsTheSameReducedTree) {
  auto mid = Unit("Architecture|mid|rtl");
  Vad::IHdlNetListNode* node = Vad::NetListWalk::FindNodeOfUnit(root_.Get(), mid.Get());
  ASSERT_NE(node, nullptr);
  Prjrep::AutoPtr<Vad::IHdlFileIterator> order;
  ASSERT_EQ(Elaboration()->getCompileOrder(node, order.Out()), CitI::kOk);
  EXPECT_EQ(FileNames(order.Get()), kMidWithItsFileMates);
  ASSERT_EQ(Elaboration()->getCompileOrder(root_.Get(), order.Out()), CitI::kOk);
  EXPECT_EQ(FileNames(order.Get()), kWholeProject);
}

TEST_F(CompileOrderByUnit, WithoutTheByUnitFlagATopNodeGetsTheOrderOfItsOwnTree) {
  auto elaborator = Elaborator();
  Prjrep::AutoPtr<Vad::IHdlParserConfig> config;
  ASSERT_EQ(project_->getParserConfig(config.Out()), CitI::kOk);
  auto mid = Unit("Architecture|mid|rtl");
  Vad::IHdlNetListNode* node = Vad::NetListWalk::FindNodeOfUnit(root_.Get(), mid.Get());
  ASSERT_NE(node, nullptr);
  Prjrep::AutoPtr<Vad::IHdlFileIterator> order;
  ASSERT_EQ(Vad::CCompileOrder::OrderBelow(*elaborator.Get(), References(), root_.Get(), node, config.Get(),
                                           false, order.Out()),
            CitI::kOk);
  EXPECT_EQ(FileNames(order.Get()), (Strings{"util.vhd", "mid.vhd"}));

  order = nullptr;
  EXPECT_EQ(Vad::CCompileOrder::OrderBelow(*elaborator.Get(), nullptr, root_.Get(), node, config.Get(), true,
                                           order.Out()),
            CitI::kInvalidArg);
  EXPECT_EQ(Vad::CCompileOrder::OrderBelow(*elaborator.Get(), References(), root_.Get(), node, nullptr, true,
                                           order.Out()),
            CitI::kInvalidArg);
  EXPECT_FALSE(order);
}

TEST_F(CompileOrderByUnit, UnitsThatAreNotOursOrMissingGetNoOrder) {
  Prjrep::AutoPtr<Vad::IHdlFileIterator> order;
  auto unit = Unit("Entity|top");
  EXPECT_EQ(Elaboration()->getCompileOrderByDU(nullptr, true, order.Out()), CitI::kFail);
  EXPECT_EQ(Elaboration()->getCompileOrderByDU(unit.Get(), true, nullptr), CitI::kFail);

  test_host::ForeignUnit foreign;
  Port_DebugCapture debug;
  EXPECT_EQ(Elaboration()->getCompileOrderByDU(&foreign, false, order.Out()), CitI::kFail);
  EXPECT_FALSE(order);
  EXPECT_EQ(debug.text(),
            "Error: CHdlView::getCompileOrderByDU() - Unable to obtain the CHdlElement pointer.\n");
}

}  // namespace
