#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "CLibRefs.h"
#include "Host/PropertyInstance.h"
#include "Identifiers.h"
#include "LibRefTestSupport.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/Casts.h"

using namespace libref_test;
using Vad::CLibRefs;

namespace {

// The registry tests work on names of their own; the cell libraries stay unloaded.
class Registry : public testing::Test {
 protected:
  void SetUp() override {
    references_.AddLibraryUnit("MyLib", "Pkg_A", "Cell_A");
    references_.AddLibraryUnit("MyLib", "Pkg_B", "Cell_B");
    references_.AddLibraryUnit("MyLibX", "Pkg_A", "Cell_X");
  }

  bool Has(std::string_view library, std::string_view package, std::string_view item, std::string_view name,
           std::string_view language = "Verilog") const {
    return references_.HasLibraryUnit(library, package, item, name, language);
  }

  ScopedEnv noCellLibraries_{"CORVANE", nullptr};
  CLibRefs references_;
};

TEST_F(Registry, AnyPackageFindsAComponentOfTheLibraryInExactCaseOrAfterLowerCasing) {
  EXPECT_TRUE(Has("MyLib", "*", "all", "Cell_A"));
  EXPECT_TRUE(Has("MyLib", "*", "all", "Cell_B", "VHDL"));
  EXPECT_TRUE(Has("MyLib", "*anything", "all", "Cell_B"));
  // Only the lower-case registry knows these spellings.
  EXPECT_TRUE(Has("mylib", "*", "all", "cell_a"));
  EXPECT_TRUE(Has("MYLIB", "*", "all", "CELL_B"));
  EXPECT_TRUE(Has("MyLib", "*", "all", "CELL_A"));

  EXPECT_FALSE(Has("MyLib", "*", "all", "Cell_X"));  // declared by another library
  EXPECT_FALSE(Has("MyLib", "*", "all", "Cell"));
}

TEST_F(Registry, ANamedPackageMustDeclareTheComponent) {
  EXPECT_TRUE(Has("MyLib", "Pkg_A", "all", "Cell_A"));
  EXPECT_TRUE(Has("mylib", "pkg_a", "all", "CELL_A"));
  EXPECT_FALSE(Has("MyLib", "Pkg_B", "all", "Cell_A"));
  EXPECT_FALSE(Has("MyLib", "Pkg_C", "all", "Cell_A"));
}

TEST_F(Registry, AnItemOtherThanAllMustNameTheComponent) {
  EXPECT_TRUE(Has("MyLib", "*", "ALL", "Cell_A"));
  EXPECT_TRUE(Has("MyLib", "*", "Cell_A", "Cell_A"));
  EXPECT_TRUE(Has("MyLib", "*", "cell_a", "Cell_A"));
  EXPECT_FALSE(Has("MyLib", "*", "Cell_B", "Cell_A"));
  EXPECT_FALSE(Has("MyLib", "Pkg_A", "everything", "Cell_A"));
}

TEST_F(Registry, ALibraryThatWasNeverLoadedKnowsNoComponent) {
  EXPECT_FALSE(Has("OtherLib", "*", "all", "Cell_A"));
  EXPECT_FALSE(Has("OtherLib", "Pkg_A", "all", "Cell_A"));
  EXPECT_FALSE(Has("", "*", "all", "Cell_A"));
  EXPECT_FALSE(Has("basecell", "*", "all", "QL_AND2"));  // CORVANE unset: nothing was loaded
}

TEST_F(Registry, RemovingALibraryForgetsItsComponentsInEveryCaseAndNoOtherLibrarys) {
  references_.RemoveLibrary("MyLib");
  EXPECT_FALSE(Has("MyLib", "*", "all", "Cell_A"));
  EXPECT_FALSE(Has("mylib", "*", "all", "cell_a"));
  EXPECT_FALSE(Has("mylib", "pkg_b", "all", "cell_b"));
  // A library whose name begins with the removed one's stays.
  EXPECT_TRUE(Has("MyLibX", "*", "all", "Cell_X"));
  EXPECT_TRUE(Has("mylibx", "pkg_a", "all", "cell_x"));

  references_.AddLibraryUnit("MyLib", "Pkg_A", "Cell_C");
  EXPECT_TRUE(Has("MyLib", "*", "all", "Cell_C"));
  EXPECT_FALSE(Has("MyLib", "*", "all", "Cell_A"));
}

TEST_F(Registry, AnswersTheImplementationIdentityWithItself) {
  EXPECT_EQ(Prjrep::ImplementationCast<CLibRefs>(&references_), &references_);
  EXPECT_EQ(references_.QueryInterface(CitI::IInterface::Iid()), &references_);
  EXPECT_NE(references_.QueryInterface(Prjrep::IRefCount::Iid()), nullptr);
  EXPECT_EQ(references_.QueryInterface(Vad::ClassIds::CLibRefs()), nullptr);
}

// ---- loaders and families ------------------------------------------------------------------------

class Families : public testing::Test {
 protected:
  void SetUp() override {
    for (const char* library : {"timecell", "basecell", "blockcell"}) {
      ASSERT_EQ(references_.AddLoader(library, std::make_unique<CountingLoader>(library, &log_)), CitI::kOk);
    }
    log_ = LoaderLog();
  }

  void Follow(std::string_view family) { references_.LoadLibraries(Port::StringBase(family)); }

  ScopedEnv noCellLibraries_{"CORVANE", nullptr};
  CLibRefs references_;
  LoaderLog log_;
};

TEST_F(Families, AnEmptyFamilyMeansKestrelAndTheSameFamilyLoadsOnlyOnce) {
  EXPECT_EQ(references_.Family(), "");
  Follow("");
  EXPECT_EQ(references_.Family(), "kestrel");
  EXPECT_EQ(log_.calls,
            (std::vector<std::string>{"basecell family kestrel", "basecell load", "timecell family kestrel",
                                      "timecell load", "blockcell family kestrel", "blockcell load"}));
  Follow("");
  Follow("kestrel");
  EXPECT_EQ(log_.loads, 3);

  Follow("lumen");
  Follow("lumen");
  EXPECT_EQ(log_.loads, 6);
  EXPECT_EQ(log_.families.back(), "lumen");
  EXPECT_EQ(references_.Family(), "lumen");
}

TEST_F(Families, AnAddedLoaderReplacesTheEarlierOneAndIsLoadedAtOnce) {
  EXPECT_TRUE(IsCell(references_, "basecell", "BASECELL_CELL"));
  LoaderLog replacementLog;
  EXPECT_EQ(
      references_.AddLoader("basecell", std::make_unique<CountingLoader>("basecell", &replacementLog, false)),
      CitI::kFail);
  EXPECT_EQ(replacementLog.loads, 1);
  EXPECT_FALSE(IsCell(references_, "basecell", "BASECELL_CELL"));
  EXPECT_EQ(references_.AddLoader("basecell", nullptr), CitI::kInvalidArg);

  Follow("lumen");
  EXPECT_EQ(replacementLog.families, std::vector<std::string>{"lumen"});
  EXPECT_EQ(log_.loads, 2);  // timecell and blockcell; the replaced basecell loader is gone
}

TEST_F(Families, ReloadingSetsTheFamilyOfTheNamedLoaderOnly) {
  EXPECT_EQ(references_.ReloadLibrary("blockcell", "lumen"), CitI::kOk);
  EXPECT_EQ(log_.calls, (std::vector<std::string>{"blockcell family lumen", "blockcell load"}));
  EXPECT_EQ(references_.ReloadLibrary("nocell", "lumen"), CitI::kFail);
  EXPECT_EQ(log_.loads, 1);
  EXPECT_EQ(references_.Family(), "");  // reloading one library does not set the project's family
}

// ---- the cell libraries under data/ --------------------------------------------------------------

class CellLibraries : public testing::Test {
 protected:
  ScopedCellLibraries corvane_;
};

TEST_F(CellLibraries, TheDefaultLibrariesAreLoadedOnConstruction) {
  CLibRefs references;
  EXPECT_TRUE(IsCell(references, "basecell", "QL_LUT4"));
  EXPECT_TRUE(IsCell(references, "basecell", "ql_and2"));
  EXPECT_TRUE(IsCell(references, "blockcell", "QB_RAM4K"));
  EXPECT_TRUE(IsCell(references, "timecell", "QT_FF"));
  EXPECT_FALSE(IsCell(references, "basecell", "QB_RAM4K"));
  EXPECT_FALSE(IsCell(references, "basecell", "LM_LUT6"));
}

TEST_F(CellLibraries, AFamilyChangeShowsTheFamilysCellsAndHidesTheReplacedOnes) {
  CLibRefs references;
  references.LoadLibraries("lumen");
  EXPECT_TRUE(IsCell(references, "basecell", "LM_LUT6"));
  EXPECT_TRUE(IsCell(references, "basecell", "QL_AND2"));
  EXPECT_FALSE(IsCell(references, "basecell", "QL_LUT4"));
  EXPECT_TRUE(IsCell(references, "blockcell", "LM_RAM9K"));
  EXPECT_FALSE(IsCell(references, "blockcell", "QB_RAM4K"));
  EXPECT_TRUE(IsCell(references, "timecell", "QT_FF"));  // lumen uses the default timing library

  // A family without libraries of its own falls back to the default ones.
  references.LoadLibraries("");
  EXPECT_TRUE(IsCell(references, "basecell", "QL_LUT4"));
  EXPECT_FALSE(IsCell(references, "basecell", "LM_LUT6"));
  EXPECT_TRUE(IsCell(references, "blockcell", "QB_RAM4K"));
  EXPECT_FALSE(IsCell(references, "blockcell", "LM_RAM9K"));
}

TEST(CellLibrariesMissing, WithoutCorvaneTheLoadersFindNothing) {
  ScopedEnv noCellLibraries("CORVANE", nullptr);
  CLibRefs references;
  references.LoadLibraries("lumen");
  for (const char* library : {"basecell", "blockcell", "timecell"}) {
    EXPECT_FALSE(references.HasLibraryUnit(library, "*", "all", "QL_AND2", "VHDL")) << library;
    EXPECT_FALSE(references.HasLibraryUnit(library, "*", "all", "LM_LUT6", "VHDL")) << library;
  }
}

}  // namespace
