// End to end through a project: the parse-result holder leaves out instances of library cells.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "../parsers/vhdl/VhdlTestFixture.h"
#include "CHdlProject.h"
#include "CLibRefs.h"

using testing::ElementsAre;

namespace {

constexpr const char* kDesign =
    "library basecell;\n"
    "use basecell.vcomponents.all;\n"
    "entity top is end;\n"
    "architecture rtl of top is\n"
    "begin\n"
    "  g1 : QL_AND2 port map (I0 => a, I1 => b, O => c);\n"
    "  g2 : ql_dff port map (D => c, C => clk, Q => q);\n"
    "  m1 : component QB_ADD8 port map (A => x, B => y, S => s);\n"
    "  t1 : QT_BUF port map (I => a, O => z);\n"
    "  u1 : my_adder port map (a => b);\n"
    "  l1 : LM_LUT6 port map (I0 => a, O => w);\n"
    "end;\n";

const std::string kArch = " parent |Architecture||rtl|top||";

class LibraryCellInstances : public vhdl_test::VhdlParse {
 protected:
  test_host::ScopedCellLibraries corvane_;
};

TEST_F(LibraryCellInstances, InstancesOfDefaultCellsAreNotRecordedButOthersAre) {
  EXPECT_THAT(
      Parse(kDesign),
      ElementsAre("|Architecture||rtl|top|| line 4 architecture uses []",
                  "|ComponentInstantiation||top|rtl|l1|LM_LUT6| line 11 instance" + kArch,
                  "|ComponentInstantiation||top|rtl|u1|my_adder| line 10 instance" + kArch,
                  "|Entity||top line 3 entity uses [||Use|basecell|vcomponents|all|]",
                  "||Library|basecell| line 1 library", "||Use|basecell|vcomponents|all| line 2 use"));
}

TEST_F(LibraryCellInstances, TheProjectsFamilyDecidesWhichNamesAreCells) {
  SetProperty(project_.Get(), "PROP_DevFamilyPMName", "lumen");
  EXPECT_THAT(
      Parse(kDesign),
      ElementsAre("|Architecture||rtl|top|| line 4 architecture uses []",
                  "|ComponentInstantiation||top|rtl|u1|my_adder| line 10 instance" + kArch,
                  "|Entity||top line 3 entity uses [||Use|basecell|vcomponents|all|]",
                  "||Library|basecell| line 1 library", "||Use|basecell|vcomponents|all| line 2 use"));
  auto* project = Prjrep::ObjectCast<Vad::CHdlProject>(project_.Get());
  ASSERT_NE(project, nullptr);
  EXPECT_EQ(project->getLibraryReferences()->Family(), "lumen");
}

}  // namespace
