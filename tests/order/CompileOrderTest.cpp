// The compile order of whole projects: dependencies, levels, ties, and the rule sequence for
// circular file dependencies, with the exact messages.
#include <gtest/gtest.h>

#include <initializer_list>

#include "OrderFixtures.h"

using namespace order_test;
namespace Text = Vad::CompileOrderText;

namespace {

using CompileOrder = OrderTest;

TEST_F(CompileOrder, UsedFilesComeFirstThenEqualLevelsInDescendingNameOrderWithLetterCaseFolded) {
  struct Case {
    const char* folder;
    std::initializer_list<std::string_view> files;
    Strings order;
  };
  // loner uses nothing and nobody uses it: level 0 like user, and after it by name.
  const Case cases[] = {
      {"single", {"alu.vhd"}, {"alu.vhd"}},
      {"package", {"loner.vhd", "shared.vhd", "user.vhd"}, {"shared.vhd", "user.vhd", "loner.vhd"}},
      {"names", {"alpha.vhd", "Beta.vhd", "gamma.vhd"}, {"gamma.vhd", "Beta.vhd", "alpha.vhd"}}};
  for (const Case& c : cases) {
    SCOPED_TRACE(c.folder);
    LoadProject(c.folder, c.files);
    EXPECT_EQ(ProjectOrder(), c.order);
    EXPECT_EQ(Messages(), Strings{});
  }
}

TEST_F(CompileOrder, MutualInstancesAreOrderedByTheRelaxedRuleWithTheCycleListedFromTheBackEdgeSource) {
  struct Case {
    const char* folder;
    std::initializer_list<std::string_view> files;
    Strings order;
    Strings cycle;
  };
  const Case cases[] = {
      // Both entity files before both architecture files: a valid order.
      {"split",
       {"a_ent.vhd", "a_rtl.vhd", "b_ent.vhd", "b_rtl.vhd"},
       {"b_ent.vhd", "a_ent.vhd", "b_rtl.vhd", "a_rtl.vhd"},
       {"b_rtl.vhd", "a_rtl.vhd"}},
      // Instances lead to architecture nodes and each entity shares its architecture's file, so the
      // relaxed rule keeps no edge at all.
      {"joined", {"a.vhd", "b.vhd"}, {"b.vhd", "a.vhd"}, {"b.vhd", "a.vhd"}},
      // Three files: listed against the edges.
      {"ring", {"p.vhd", "q.vhd", "r.vhd"}, {"r.vhd", "q.vhd", "p.vhd"}, {"r.vhd", "q.vhd", "p.vhd"}}};
  for (const Case& c : cases) {
    SCOPED_TRACE(c.folder);
    LoadProject(c.folder, c.files);
    EXPECT_EQ(ProjectOrder(), c.order);
    Strings expected{Warning(Text::kStrictCycle), Warning(Text::kCycleHeader)};
    for (const std::string& file : c.cycle) expected.push_back(CycleLine(c.folder, file));
    for (const char* text : {Text::kCycleEnd, Text::kRelaxing, Text::kRelaxedOrderValid})
      expected.push_back(Warning(text));
    EXPECT_EQ(Messages(), expected);
  }
  for (const Port_MsgRecord& record : log_.Records()) {
    EXPECT_EQ(record.category, "ProjectMgmt");
    EXPECT_EQ(record.sourceFile, "../src/CElaborator");
    EXPECT_GT(record.line, 0);
  }
}

TEST_F(CompileOrder, ACycleThatSurvivesTheRelaxedRuleIsListedAgainCutAndStillOrdered) {
  AddFiles("tangled", {"x.vhd", "y.vhd"});
  Root();
  const std::string y = CycleLine("tangled", "y.vhd");
  const std::string x = CycleLine("tangled", "x.vhd");
  const std::string header = Warning(Text::kCycleHeader);
  const std::string end = Warning(Text::kCycleEnd);
  // x's architecture reaches y.vhd twice (package, instance) and y's reaches x.vhd twice, so the
  // strict search meets the back edge y->x twice; the relaxed graph keeps one edge each way.
  EXPECT_EQ(ProjectOrder(), (Strings{"y.vhd", "x.vhd"}));
  EXPECT_EQ(Messages(), (Strings{Warning(Text::kStrictCycle), header, y, x, end, header, y, x, end,
                                 Warning(Text::kRelaxing), Warning(Text::kRelaxedCycle), header, y, x, end,
                                 Warning(Text::kBreaking), Warning(Text::kNoValidOrder)}));
}

TEST_F(CompileOrder, AWholeProjectIsOrderedAcrossAllTopNodes) {
  AddFiles("units",
           {"top.vhd", "mid.vhd", "util.vhd", "leaf_ent.vhd", "leaf_rtl.vhd", "other.vhd", "orphan.vhd"});
  AddFile("units", "counter.sm", "PLUGIN_SingleModule");
  AddFile("units", "notes.txt", "PLUGIN_General");
  Root();
  // util is used at the end of the longest chain (mid -> leaf_rtl -> leaf_ent -> util); the
  // generic text file is in no tree.
  EXPECT_EQ(ProjectOrder(), (Strings{"util.vhd", "leaf_ent.vhd", "leaf_rtl.vhd", "mid.vhd", "top.vhd",
                                     "other.vhd", "orphan.vhd", "counter.sm"}));
  EXPECT_EQ(Messages(), Strings{});
}

TEST_F(CompileOrder, AnEmptyProjectHasAnEmptyOrder) {
  Root();
  Prjrep::AutoPtr<Vad::IHdlFileIterator> order;
  ASSERT_EQ(Elaboration()->getCompileOrder(nullptr, order.Out()), CitI::kOk);
  ASSERT_TRUE(order);
  EXPECT_TRUE(order->IsDone());
}

TEST_F(CompileOrder, TheOrderIsRecomputedAfterAFileIsAdded) {
  AddFiles("package", {"user.vhd", "loner.vhd"});
  EXPECT_EQ(ProjectOrder(), (Strings{"user.vhd", "loner.vhd"}));
  AddFile("package", "shared.vhd");
  EXPECT_EQ(ProjectOrder(), (Strings{"shared.vhd", "user.vhd", "loner.vhd"}));
}

TEST_F(CompileOrder, AnOrderOutlivesTheProjectThatMadeIt) {
  AddFiles("package", {"shared.vhd", "user.vhd"});
  Prjrep::AutoPtr<Vad::IHdlFileIterator> order;
  ASSERT_EQ(Elaboration()->getCompileOrder(nullptr, order.Out()), CitI::kOk);
  project_ = nullptr;
  EXPECT_EQ(FileNames(order.Get()), (Strings{"shared.vhd", "user.vhd"}));
}

TEST_F(CompileOrder, MissingArgumentsAreRefused) {
  AddFile("single", "alu.vhd");
  auto root = Root();
  auto elaborator = Elaborator();
  Prjrep::AutoPtr<Vad::IHdlParserConfig> config;
  ASSERT_EQ(project_->getParserConfig(config.Out()), CitI::kOk);
  Prjrep::AutoPtr<Vad::IHdlFileIterator> earlier;
  ASSERT_EQ(Elaboration()->getCompileOrder(nullptr, earlier.Out()), CitI::kOk);
  Vad::IHdlFileIterator* out = earlier.Get();

  EXPECT_EQ(Vad::CCompileOrder::OrderBelow(*elaborator.Get(), References(), nullptr, nullptr, config.Get(),
                                           true, &out),
            CitI::kInvalidArg);
  EXPECT_EQ(out, earlier.Get());  // untouched
  EXPECT_EQ(Vad::CCompileOrder::OrderBelow(*elaborator.Get(), References(), root.Get(), nullptr, config.Get(),
                                           true, nullptr),
            CitI::kInvalidArg);
  EXPECT_EQ(Elaboration()->getCompileOrder(nullptr, nullptr), CitI::kInvalidArg);
}

}  // namespace
