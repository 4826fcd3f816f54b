#include <gtest/gtest.h>

#include <memory>
#include <string>

#include "vci/VerilogMacroState.h"
#include "vci/VerilogMacroTable.h"

namespace {

using Hx_Vci::VerilogMacro;
using Hx_Vci::VerilogMacroState;
using Hx_Vci::VerilogMacroTable;

VerilogMacro Body(const std::string& body) {
  VerilogMacro macro;
  macro.body = body;
  return macro;
}

TEST(VerilogMacroTable, FingerprintDependsOnTheDefinitionsNotOnTheirHistory) {
  VerilogMacroTable forward;
  forward.Define("A", Body("1"));
  forward.Define("B", Body("2"));
  VerilogMacroTable backward;
  backward.Define("B", Body("2"));
  backward.Define("A", Body("old"));
  backward.Define("A", Body("1"));
  backward.Define("C", Body("3"));
  EXPECT_NE(forward.fingerprint(), backward.fingerprint());
  EXPECT_TRUE(backward.Undefine("C"));
  EXPECT_EQ(forward.fingerprint(), backward.fingerprint());
  EXPECT_FALSE(backward.Define("A", Body("1"))) << "an identical definition changes nothing";
  EXPECT_FALSE(backward.Undefine("C"));

  VerilogMacro withParameter = Body("1");
  withParameter.hasParameters = true;
  VerilogMacroTable other;
  other.Define("A", withParameter);
  other.Define("B", Body("2"));
  EXPECT_NE(forward.fingerprint(), other.fingerprint());
}

TEST(VerilogMacroTable, LayersSeeTheirBaseAndLeaveItUnchanged) {
  auto base = std::make_shared<VerilogMacroTable>();
  base->Define("KEEP", Body("k"));
  base->Define("GONE", Body("g"));
  std::shared_ptr<const VerilogMacroTable> current = base;
  for (int i = 0; i < 3 * VerilogMacroTable::kMaxLayers; ++i) {
    VerilogMacroState state(current);
    state.Define("M" + std::to_string(i), Body(std::to_string(i)));
    if (i == 5) state.Undefine("GONE");
    current = state.Snapshot();
  }
  ASSERT_NE(current->Find("KEEP"), nullptr);
  EXPECT_EQ(current->Find("KEEP")->body, "k");
  EXPECT_EQ(current->Find("GONE"), nullptr);
  EXPECT_EQ(current->Find("M0")->body, "0");
  EXPECT_EQ(current->Find("M95")->body, "95");
  EXPECT_NE(base->Find("GONE"), nullptr);
  EXPECT_EQ(base->Find("M0"), nullptr);

  VerilogMacroTable same;
  same.Define("KEEP", Body("k"));
  for (int i = 0; i < 3 * VerilogMacroTable::kMaxLayers; ++i)
    same.Define("M" + std::to_string(i), Body(std::to_string(i)));
  EXPECT_EQ(current->fingerprint(), same.fingerprint());

  VerilogMacroState unchanged(current);
  unchanged.Define("KEEP", Body("k"));
  EXPECT_EQ(unchanged.Snapshot(), current) << "no layer for a file that changes nothing";
}

}  // namespace
