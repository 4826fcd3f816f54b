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
using Strings = std::vector<std::string>;

namespace {

constexpr CitI::Result kNotOrderedByKind = 4;
constexpr CitI::Result kUnitNotInTree = 5;

// A design unit of no module of ours.
class ForeignUnit final : public Vad::IHdlDesignUnit {
 public:
  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    return id == Vad::IHdlDesignUnit::Iid() || id == CitI::IInterface::Iid() ? this : nullptr;
  }
  CitI::Result GetDesignUnit(CitI::IInterface*, Vad::IHdlDesignUnit**) override { return CitI::kOk; }
  CitI::Result GetUnitFlag(std::int32_t, bool*) override { return CitI::kFail; }
  CitI::Result GetDesignUnitTypeId(Port::XUID*) override { return CitI::kFail; }
};

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

TEST_F(CompileOrderByUnit, AModuleByItselfIsJustItsOwnFile) {
  EXPECT_EQ(OrderOf("Module|counter", true), Strings{"counter.sm"});
  EXPECT_EQ(OrderOf("Module|counter", false), Strings{"counter.sm"});
  EXPECT_EQ(Messages(), Strings{});
}

TEST_F(CompileOrderByUnit, AnEntityByItselfGetsTheOrderOfTheWholeTree) {
  EXPECT_EQ(OrderOf("Entity|top", true), kWholeProject);
}

TEST_F(CompileOrderByUnit, AnArchitectureByItselfGetsTheOrderOfItsEntitysTree) {
  // Not the architecture's own file: the entity node's tree is the entity and the package it uses.
  EXPECT_EQ(OrderOf("Architecture|leaf|rtl", true), (Strings{"util.vhd", "leaf_ent.vhd"}));
  EXPECT_EQ(OrderOf("Architecture|mid|rtl", true), Strings{"mid.vhd"});
  EXPECT_EQ(Messages(), Strings{});
}

TEST_F(CompileOrderByUnit, AnArchitectureWithoutAnEntityInTheProjectHasNoOrderByItself) {
  OrderOf("Architecture|ghost|rtl", true, kUnitNotInTree);
  EXPECT_EQ(OrderOf("Architecture|ghost|rtl", false), Strings{"orphan.vhd"});
}

TEST_F(CompileOrderByUnit, APackageByItselfIsNotOrdered) {
  OrderOf("PackageDecl|util", true, kNotOrderedByKind);
  EXPECT_EQ(OrderOf("PackageDecl|util", false), Strings{"util.vhd"});
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

TEST_F(CompileOrderByUnit, AUnitWithItsDependenciesTakesAlongTheUnitsThatShareItsFiles) {
  EXPECT_EQ(OrderOf("Architecture|mid|rtl", false), kMidWithItsFileMates);
  EXPECT_EQ(OrderOf("Entity|side", false), kMidWithItsFileMates);
  EXPECT_EQ(OrderOf("Architecture|top|rtl", false),
            (Strings{"util.vhd", "leaf_ent.vhd", "leaf_rtl.vhd", "mid.vhd", "top.vhd"}));
  EXPECT_EQ(OrderOf("Architecture|other|rtl", false), Strings{"other.vhd"});
  EXPECT_EQ(Messages(), Strings{});
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
}

TEST_F(CompileOrderByUnit, UnitsThatAreNotOursOrMissingGetNoOrder) {
  Prjrep::AutoPtr<Vad::IHdlFileIterator> order;
  auto unit = Unit("Entity|top");
  EXPECT_EQ(Elaboration()->getCompileOrderByDU(nullptr, true, order.Out()), CitI::kFail);
  EXPECT_EQ(Elaboration()->getCompileOrderByDU(unit.Get(), true, nullptr), CitI::kFail);

  ForeignUnit foreign;
  Port_DebugCapture debug;
  EXPECT_EQ(Elaboration()->getCompileOrderByDU(&foreign, false, order.Out()), CitI::kFail);
  EXPECT_FALSE(order);
  EXPECT_EQ(debug.text(),
            "Error: CHdlView::getCompileOrderByDU() - Unable to obtain the CHdlElement pointer.\n");
}

TEST_F(CompileOrderByUnit, TheReducedTreeNeedsEveryArgument) {
  auto elaborator = Elaborator();
  Prjrep::AutoPtr<Vad::IHdlParserConfig> config;
  ASSERT_EQ(project_->getParserConfig(config.Out()), CitI::kOk);
  auto mid = Unit("Architecture|mid|rtl");
  Vad::IHdlNetListNode* node = Vad::NetListWalk::FindNodeOfUnit(root_.Get(), mid.Get());
  Prjrep::AutoPtr<Vad::IHdlFileIterator> order;
  EXPECT_EQ(Vad::CCompileOrder::OrderBelow(*elaborator.Get(), nullptr, root_.Get(), node, config.Get(), true,
                                           order.Out()),
            CitI::kInvalidArg);
  EXPECT_EQ(Vad::CCompileOrder::OrderBelow(*elaborator.Get(), References(), root_.Get(), node, nullptr, true,
                                           order.Out()),
            CitI::kInvalidArg);
  EXPECT_FALSE(order);
}

}  // namespace
