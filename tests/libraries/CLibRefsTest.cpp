#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "CLibLoader.h"
#include "CLibRefs.h"
#include "TestHost.h"
#include "rudiva/RudIva.h"

using test_host::ScopedCellLibraries;
using Vad::CLibRefs;

namespace {

bool IsCell(const CLibRefs& references, std::string_view library, std::string_view name) {
  return references.HasLibraryUnit(library, "vcomponents", "all", name, "VHDL");
}

// What the counting loaders were asked to do, kept outside them because the references own them:
// "<library> load" and "<library> family <name>" for every call.
struct LoaderLog {
  int loads = 0;
  std::vector<std::string> families;
  std::vector<std::string> calls;
};

// Logs its loads and families and declares one component, "<LIBRARY>_CELL", in "vcomponents".
class CountingLoader final : public Vad::CLibLoader {
 public:
  CountingLoader(const char* library, LoaderLog* log, bool loads = true)
      : CLibLoader(library, "chdp.ini", RudIva::kSynthesisLibraries), log_(log), loads_(loads) {}

  bool Load(Vad::CLibRefs* references) override {
    ++log_->loads;
    log_->calls.push_back(LibraryName().str() + " load");
    references->RemoveLibrary(LibraryName());
    Port::StringBase cell = LibraryName();
    cell.MakeUpper();
    if (loads_) references->AddLibraryUnit(LibraryName(), "vcomponents", cell.str() + "_CELL");
    return loads_;
  }
  void SetFamily(const Port::StringBase& family) override {
    log_->families.push_back(family.str());
    log_->calls.push_back(LibraryName().str() + " family " + family.str());
  }

 protected:
  Port::StringBase FamilyTestFile(const Port::StringBase&) const override { return {}; }
  Port::StringBase FamilyDirectory(const Port::StringBase&) const override { return {}; }
  Port::StringBase DefaultDirectory() const override { return {}; }
  Port::StringBase MappingTextFor(const Port::StringBase&) const override { return {}; }

 private:
  LoaderLog* log_;
  bool loads_;
};

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

// A package "*..." stands for any package of the library, an item other than "all" must name the
// component, and names match exactly or after lower-casing both sides.
TEST_F(Registry, ComponentLookUpFollowsLibraryPackageItemAndLetterCase) {
  struct Case {
    const char* library;
    const char* package;
    const char* item;
    const char* name;
    bool found;
  };
  const Case cases[] = {
      {"MyLib", "*", "all", "Cell_A", true},      {"MyLib", "*anything", "all", "Cell_B", true},
      {"mylib", "*", "all", "cell_a", true},      {"MYLIB", "*", "all", "CELL_B", true},
      {"MyLib", "*", "all", "CELL_A", true},      {"MyLib", "*", "all", "Cell_X", false},
      {"MyLib", "*", "all", "Cell", false},       {"MyLib", "Pkg_A", "all", "Cell_A", true},
      {"mylib", "pkg_a", "all", "CELL_A", true},  {"MyLib", "Pkg_B", "all", "Cell_A", false},
      {"MyLib", "Pkg_C", "all", "Cell_A", false}, {"MyLib", "*", "ALL", "Cell_A", true},
      {"MyLib", "*", "Cell_A", "Cell_A", true},   {"MyLib", "*", "cell_a", "Cell_A", true},
      {"MyLib", "*", "Cell_B", "Cell_A", false},  {"MyLib", "Pkg_A", "everything", "Cell_A", false},
      {"OtherLib", "*", "all", "Cell_A", false},  {"OtherLib", "Pkg_A", "all", "Cell_A", false},
      {"", "*", "all", "Cell_A", false},          {"basecell", "*", "all", "QL_AND2", false},
  };
  for (const Case& c : cases) {
    EXPECT_EQ(Has(c.library, c.package, c.item, c.name), c.found)
        << c.library << " " << c.package << " " << c.item << " " << c.name;
  }
  EXPECT_TRUE(Has("MyLib", "*", "all", "Cell_B", "VHDL"));
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

// The cell libraries under data/: the default ones on construction, a family's own after a family
// change (replacing the default cells), and the default ones again for a family without its own.
TEST(CellLibraries, EachFamilyShowsItsOwnCellsAndHidesTheReplacedOnes) {
  ScopedCellLibraries corvane;
  CLibRefs references;
  // "<library>.<cell>" for every cell that must be there, "!<library>.<cell>" for one that must not.
  const auto expectCells = [&](const char* family, const std::vector<std::string>& cells) {
    for (const std::string& cell : cells) {
      const bool absent = cell[0] == '!';
      const std::size_t dot = cell.find('.');
      const std::string library = cell.substr(absent ? 1 : 0, dot - (absent ? 1 : 0));
      EXPECT_EQ(IsCell(references, library, cell.substr(dot + 1)), !absent) << family << " " << cell;
    }
  };
  expectCells("default", {"basecell.QL_LUT4", "basecell.ql_and2", "blockcell.QB_RAM4K", "timecell.QT_FF",
                          "!basecell.QB_RAM4K", "!basecell.LM_LUT6"});
  references.LoadLibraries("lumen");
  expectCells("lumen", {"basecell.LM_LUT6", "basecell.QL_AND2", "blockcell.LM_RAM9K", "timecell.QT_FF",
                        "!basecell.QL_LUT4", "!blockcell.QB_RAM4K"});
  references.LoadLibraries("");
  expectCells("kestrel",
              {"basecell.QL_LUT4", "blockcell.QB_RAM4K", "!basecell.LM_LUT6", "!blockcell.LM_RAM9K"});

  ScopedEnv noCellLibraries("CORVANE", nullptr);
  CLibRefs without;
  without.LoadLibraries("lumen");
  for (const char* library : {"basecell", "blockcell", "timecell"}) {
    EXPECT_FALSE(without.HasLibraryUnit(library, "*", "all", "QL_AND2", "VHDL")) << library;
    EXPECT_FALSE(without.HasLibraryUnit(library, "*", "all", "LM_LUT6", "VHDL")) << library;
  }
}

}  // namespace
