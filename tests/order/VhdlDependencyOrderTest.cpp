// The compile order that the VHDL constructs beyond plain instances and use clauses imply. Each
// project is named so that, without the dependency, the user would come first (files of equal
// level come in descending name order).
#include <gtest/gtest.h>

#include <cstdio>
#include <string>
#include <string_view>
#include <vector>

#include "OrderFixtures.h"
#include "ScopedTempDir.h"

using namespace order_test;

namespace {

class VhdlDependencyOrder : public OrderTest {
 protected:
  void AddSource(std::string_view name, std::string_view text) {
    AddNewFile(project_.Get(), WriteBytes(dir_.Path(name), text), "PLUGIN_Vhdl");
  }

  ScopedTempDir dir_;
};

constexpr std::string_view kSub =
    "entity sub is end;\n"
    "architecture rtl of sub is begin end;\n";

TEST_F(VhdlDependencyOrder, MaplessInstancesPutTheInstantiatedFileFirst) {
  for (std::string_view instance : {"u : entity work.sub(rtl);", "u : entity work.sub;", "u : sub;",
                                    "u : component sub;", "u : entity work.sub generic map (N => 1);"}) {
    SCOPED_TRACE(std::string(instance));
    project_ = NewProject();
    AddSource("sub.vhd", kSub);
    AddSource("top.vhd",
              "entity top is end;\narchitecture rtl of top is\n"
              "  component sub end component;\nbegin\n  " +
                  std::string(instance) + "\nend;\n");
    Root();
    EXPECT_EQ(ProjectOrder(), (Strings{"sub.vhd", "top.vhd"}));
  }
}

TEST_F(VhdlDependencyOrder, ContextsComeBeforeTheirUsersAndAfterWhatTheyUse) {
  AddSource("a_types.vhd", "package types_pkg is end;\n");
  AddSource("b_ctx.vhd", "context design_ctx is\n  library ieee;\n  use work.types_pkg.all;\nend context;\n");
  AddSource("c_user.vhd", "context work.design_ctx;\nentity user is end;\n");
  Root();
  EXPECT_EQ(ProjectOrder(), (Strings{"a_types.vhd", "b_ctx.vhd", "c_user.vhd"}));
}

TEST_F(VhdlDependencyOrder, PackageInstancesComeAfterTheirGenericPackageAndItsFormals) {
  AddSource("a_math.vhd", "package generic_math is generic (W : natural); end;\n");
  AddSource("b_fifo.vhd",
            "package generic_fifo is\n"
            "  generic (package math is new work.generic_math generic map (<>));\n"
            "end package;\n");
  AddSource("c_inst.vhd",
            "library ieee;\npackage fifo8 is new work.generic_fifo generic map (math => work.m8);\n");
  AddSource("d_user.vhd", "use work.fifo8.all;\nentity user is end;\n");
  AddSource("e_m8.vhd", "package m8 is new work.generic_math generic map (W => 8);\n");
  Root();
  EXPECT_EQ(ProjectOrder(), (Strings{"a_math.vhd", "e_m8.vhd", "b_fifo.vhd", "c_inst.vhd", "d_user.vhd"}));
}

TEST_F(VhdlDependencyOrder, ConfigurationsComeAfterWhatTheyConfigureAndBeforeTheirInstances) {
  AddSource("a_cfg.vhd",
            "configuration sub_cfg of sub is\n"
            "  for rtl\n"
            "  end for;\n"
            "end configuration;\n");
  AddSource("b_sub_rtl.vhd", "architecture rtl of sub is begin end;\n");
  AddSource("c_sub.vhd", "entity sub is end;\n");
  AddSource(
      "d_top.vhd",
      "entity top is end;\narchitecture rtl of top is\nbegin\n  u : configuration work.sub_cfg;\nend;\n");
  Root();
  EXPECT_EQ(ProjectOrder(), (Strings{"c_sub.vhd", "b_sub_rtl.vhd", "a_cfg.vhd", "d_top.vhd"}));
}

}  // namespace
