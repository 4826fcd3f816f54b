// The VHDL constructs that give dependencies without the forms of the first grammar: map-less
// instantiations, context declarations and references, package instances, generic packages and
// configurations.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>

#include "VhdlTestFixture.h"

using testing::ElementsAre;
using vhdl_test::VhdlParse;

namespace {

const std::string kTopRtl = " parent |Architecture||rtl|top||";
const std::string kCfg = " parent |PackageDecl||top_cfg|";

TEST_F(VhdlParse, ConstructsBeyondThePlainFormsGiveTheirDependencies) {
  ExpectParses({
      {"InstancesWithoutAMapAspectAreRecordedInAllThreeForms",
       "entity top is end;\n"
       "architecture rtl of top is\n"
       "begin\n"
       "  u1 : entity work.sub(rtl);\n"
       "  u2 : sub;\n"
       "  u3 : component sub;\n"
       "  u4 : entity work.sub generic map (W => 2);\n"
       "  u5 : component sub port map (a => b);\n"
       "  g : for i in 0 to 1 generate\n"
       "    u6 : sub;\n"
       "  end generate;\n"
       "end;\n",
       {"|Architecture||rtl|top|| line 2 architecture uses []",
        "|ComponentInstantiation||top|rtl|u2|sub| line 5 instance" + kTopRtl,
        "|ComponentInstantiation||top|rtl|u3|sub| line 6 instance" + kTopRtl,
        "|ComponentInstantiation||top|rtl|u5|sub| line 8 instance" + kTopRtl,
        "|ComponentInstantiation||top|rtl|u6|sub| line 10 instance" + kTopRtl + " generate",
        "|EntityInstantiation||top|rtl|u1|work.sub||rtl line 4 instance" + kTopRtl,
        "|EntityInstantiation||top|rtl|u4|work.sub|| line 7 instance" + kTopRtl,
        "|Entity||top line 1 entity uses []"}},
      {"DeclarationsShapedLikeMaplessInstancesRecordNothing",
       "entity top is\n"
       "  generic (W : natural);\n"
       "  port (clk : bit; q : bit);\n"
       "end;\n"
       "architecture rtl of top is\n"
       "  signal s : bit;\n"
       "  signal a, b : bit;\n"
       "  type pair is record\n"
       "    lo : bit;\n"
       "    hi : bit;\n"
       "  end record;\n"
       "  component sub port (x : bit); end component;\n"
       "begin\n"
       "  p : process\n"
       "    variable v : integer;\n"
       "  begin\n"
       "    step : tick;\n"
       "  end process;\n"
       "  blk : block\n"
       "    signal t : bit;\n"
       "  begin\n"
       "  end block;\n"
       "end;\n",
       {"|Architecture||rtl|top|| line 5 architecture uses []", "|Entity||top line 2 entity flag uses []"}},
      {"ContextDeclarationCollectsItsClausesAndReferencesAreUses1",
       "context shared_ctx is\n"
       "  library ieee;\n"
       "  use ieee.std_logic_1164.all;\n"
       "  context work.base_ctx;\n"
       "  use work.types_pkg.all;\n"
       "end context shared_ctx;\n"
       "context work.shared_ctx, tools.tool_ctx;\n"
       "entity top is end;\n",
       {"|Entity||top line 8 entity uses [||Use|work|shared_ctx|| ||Use|tools|tool_ctx||]",
        "|PackageDecl||shared_ctx| line 1 package uses [||Use|ieee|std_logic_1164|all| "
        "||Use|work|base_ctx|| ||Use|work|types_pkg|all|]",
        "||Library|ieee| line 2 library", "||Use|ieee|std_logic_1164|all| line 3 use",
        "||Use|tools|tool_ctx|| line 7 use", "||Use|work|base_ctx|| line 4 use",
        "||Use|work|shared_ctx|| line 7 use", "||Use|work|types_pkg|all| line 5 use"}},
      // "end;" closes a context declaration too: the use clause after it waits for the entity.
      {"ContextDeclarationCollectsItsClausesAndReferencesAreUses2",
       "context c is use work.p.all; end;\n"
       "use work.q.all;\n"
       "entity e is end;\n",
       {"|Entity||e line 3 entity uses [||Use|work|q|all|]",
        "|PackageDecl||c| line 1 package uses [||Use|work|p|all|]", "||Use|work|p|all| line 1 use",
        "||Use|work|q|all| line 2 use"}},
      {"PackageInstancesAndFormalPackagesUseTheirGenericPackage",
       "library ieee;\n"
       "package fifo_pkg is new work.generic_fifo\n"
       "  generic map (DEPTH => 8);\n"
       "package generic_fifo is\n"
       "  generic (DEPTH : natural;\n"
       "           package math is new work.generic_math generic map (<>));\n"
       "end package;\n"
       "entity top is\n"
       "  generic (package cfg is new work.generic_cfg generic map (<>));\n"
       "end;\n"
       "architecture rtl of top is\n"
       "  package local_fifo is new work.generic_fifo generic map (DEPTH => 2);\n"
       "begin\n"
       "end;\n",
       {"|Architecture||rtl|top|| line 11 architecture uses [||Use|work|generic_fifo||]",
        "|Entity||top line 9 entity uses [||Use|work|generic_cfg||]",
        "|PackageDecl||fifo_pkg| line 2 package uses [||Use|work|generic_fifo||]",
        "|PackageDecl||generic_fifo| line 4 package uses [||Use|work|generic_math||]",
        "||Library|ieee| line 1 library", "||Use|work|generic_cfg|| line 9 use",
        "||Use|work|generic_fifo|| line 2 use", "||Use|work|generic_math|| line 6 use"}},
      {"GenericMapActualsNamingUnitsOfKnownLibrariesAreUsesOfThePackageInstance",
       "library shapes;\n"
       "package fifo8 is new work.generic_fifo\n"
       "  generic map (DEPTH => 8, math => work.math8, rec => r.field,\n"
       "               sizes => shapes.sizes_pkg.WIDE, W => f(work.k), z => ieee.c);\n",
       {"|PackageDecl||fifo8| line 2 package uses [||Use|work|generic_fifo|| "
        "||Use|work|math8|| ||Use|shapes|sizes_pkg|WIDE|]",
        "||Library|shapes| line 1 library", "||Use|shapes|sizes_pkg|WIDE| line 4 use",
        "||Use|work|generic_fifo|| line 2 use", "||Use|work|math8|| line 3 use"}},
      {"ConfigurationDependsOnTheArchitectureAndBindingsItConfigures",
       "use work.cfg_pkg.all;\n"
       "configuration top_cfg of top is\n"
       "  for rtl\n"
       "    for u1 : adder use entity work.fast_adder(rtl);\n"
       "    end for;\n"
       "    for gen\n"
       "      for all : sub use configuration work.sub_cfg;\n"
       "      end for;\n"
       "    end for;\n"
       "  end for;\n"
       "end configuration top_cfg;\n"
       "use work.late.all;\n"
       "entity after is end;\n",
       {"|EntityInstantiation||top_cfg||ALL|work.sub_cfg|| line 7 instance" + kCfg,
        "|EntityInstantiation||top_cfg||top|top||rtl line 3 instance" + kCfg,
        "|EntityInstantiation||top_cfg||u1|work.fast_adder||rtl line 4 instance" + kCfg,
        "|Entity||after line 13 entity uses [||Use|work|late|all|]",
        "|PackageDecl||top_cfg| line 2 package uses [||Use|work|cfg_pkg|all|]",
        "||Use|work|cfg_pkg|all| line 1 use", "||Use|work|late|all| line 12 use"}},
      {"ConfigurationInstanceNamesTheConfiguration",
       "entity top is end;\n"
       "architecture rtl of top is\n"
       "begin\n"
       "  u1 : configuration work.sub_cfg;\n"
       "  u2 : configuration work.sub_cfg port map (a => b);\n"
       "end;\n",
       {"|Architecture||rtl|top|| line 2 architecture uses []",
        "|EntityInstantiation||top|rtl|u1|work.sub_cfg|| line 4 instance" + kTopRtl,
        "|EntityInstantiation||top|rtl|u2|work.sub_cfg|| line 5 instance" + kTopRtl,
        "|Entity||top line 1 entity uses []"}},
  });
}

}  // namespace
