#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <optional>
#include <sstream>
#include <string>
#include <system_error>
#include <vector>

#include "Port/Env.h"
#include "Port/File.h"
#include "Port/StringBase.h"
#include "ScopedEnv.h"
#include "ScopedTempDir.h"
#include "ScopedWorkingDirectory.h"
#include "rudiva/RudIva.h"
#include "rudiva/RudIva_LibraryMap.h"

namespace fs = std::filesystem;

namespace {

using Names = std::vector<std::string>;

void WriteFile(const std::string& path, const std::string& text) {
  std::error_code ignored;
  fs::create_directories(fs::path(path).parent_path(), ignored);
  std::ofstream(path, std::ios::binary) << text;
}

// Each test works in a fresh current directory, with CORVANE naming the repository's data folder.
class LibraryLoader : public testing::Test {
 protected:
  RudIva_Node* Load(const char* library, int mode = RudIva::kSynthesisLibraries,
                    const char* unit = "vcomponents") {
    return loader_->loadLibUnit(library, unit, "", RudIva::kPackageObject, mode);
  }

  Names ComponentsOf(RudIva_Node* node) const {
    Names names;
    for (RudIva_Node* member : loader_->getMembers(node, RudIva::kDeclarationMembers)) {
      EXPECT_EQ(loader_->getType(member), RudIva::kComponentDeclaration);
      names.push_back(loader_->getName(member));
    }
    return names;
  }

  static bool Has(const Names& names, const std::string& name) {
    return std::find(names.begin(), names.end(), name) != names.end();
  }

  ScopedTempDir temp_;
  ScopedWorkingDirectory inTemp_{temp_.path()};
  ScopedEnv corvane_{"CORVANE", Port_Env::GetInstallRoot().c_str()};
  RudIva* loader_ = RudIva::getPLI();
};

const char kPackage[] = "package vcomponents is component %s port (x : in bit); end component; end;";

std::string PackageDeclaring(const std::string& component) {
  std::string text = kPackage;
  return text.replace(text.find("%s"), 2, component);
}

}  // namespace

TEST_F(LibraryLoader, LoadsTheSampleCellLibrariesThroughTheirMappingLines) {
  WriteFile("chdp.ini",
            "std=$CORVANE/vhdl/syn/std\nieee=$CORVANE/vhdl/syn/ieee\nblockcell=$CORVANE/vhdl/syn/blockcell\n"
            "basecell=$CORVANE/vhdl/syn/basecell\n");
  WriteFile("corvanesim.ini", "std=$CORVANE/vhdl/hdp/nt/std\ntimecell=$CORVANE/vhdl/hdp/nt/timecell\n");

  RudIva_Node* basecell = Load("basecell");
  ASSERT_NE(basecell, nullptr) << loader_->lastError();
  EXPECT_EQ(loader_->lastFailure(), RudIva::Failure::kNone);
  EXPECT_EQ(loader_->getName(basecell), "vcomponents");
  EXPECT_EQ(loader_->getType(basecell), RudIva::kPackageObject);
  Names cells = ComponentsOf(basecell);
  EXPECT_GE(cells.size(), 24u);
  EXPECT_EQ(cells.front(), "QL_TIEHI");
  for (const char* cell :
       {"QL_AND2", "QL_DFFRE", "QL_LATCH", "QL_IOBUF", "QL_RAM16X1S", "QL_PLL", "QL_LUT4"}) {
    EXPECT_TRUE(Has(cells, cell)) << cell;
  }

  Names blocks = ComponentsOf(Load("blockcell"));
  EXPECT_TRUE(Has(blocks, "QB_RAM4K"));
  EXPECT_TRUE(Has(blocks, "QB_MULT18X18"));

  Names timing = ComponentsOf(Load("timecell", RudIva::kSimulationLibraries));
  EXPECT_TRUE(Has(timing, "QT_FF"));
  EXPECT_TRUE(Has(timing, "QT_IOPAD"));
}

TEST_F(LibraryLoader, FamilyLibrariesDifferFromTheDefaultOnes) {
  WriteFile("chdp.ini",
            "basecell=$CORVANE/lumen/vhdl/syn/basecell\nblockcell=${CORVANE}/lumen/vhdl/syn/blockcell\n");
  Names cells = ComponentsOf(Load("basecell"));
  EXPECT_TRUE(Has(cells, "LM_LUT6"));
  EXPECT_TRUE(Has(cells, "QL_AND2"));
  EXPECT_FALSE(Has(cells, "QL_LUT4"));
  Names blocks = ComponentsOf(Load("blockcell"));
  EXPECT_TRUE(Has(blocks, "LM_RAM9K"));
  EXPECT_FALSE(Has(blocks, "QB_RAM4K"));

  std::string timecellTest =
      "$CORVANE/lumen/vhdl/hdp/" + std::string(Port_Env::GetPlatformPath()) + "/timecell/arch.vho";
  EXPECT_TRUE(Port_Env::GetDataFileName(timecellTest.c_str(), 1, nullptr));
}

TEST_F(LibraryLoader, AnswersNullAndSaysWhyWhenTheUnitCannotBeFound) {
  EXPECT_EQ(Load("basecell"), nullptr);
  EXPECT_EQ(loader_->lastFailure(), RudIva::Failure::kNoMappingFile);

  WriteFile("corvanesim.ini", "basecell=$CORVANE/vhdl/syn/basecell\n");
  EXPECT_EQ(Load("basecell"), nullptr) << "mode 1 reads chdp.ini only";
  EXPECT_EQ(loader_->lastFailure(), RudIva::Failure::kNoMappingFile);

  WriteFile("chdp.ini",
            "ieee=$CORVANE/vhdl/syn/ieee\nbasecell=$CORVANE/vhdl/syn/basecell\nmissing=$CORVANE/no/such/dir\n"
            "stray=$QUILLON_UNSET_VARIABLE/x\n");
  EXPECT_EQ(Load("blockcell"), nullptr);
  EXPECT_EQ(loader_->lastFailure(), RudIva::Failure::kLibraryNotMapped);
  EXPECT_NE(loader_->lastError().find("blockcell"), std::string::npos);
  EXPECT_EQ(Load("missing"), nullptr);
  EXPECT_EQ(loader_->lastFailure(), RudIva::Failure::kNoLibraryDirectory);
  EXPECT_EQ(Load("stray"), nullptr);
  EXPECT_EQ(loader_->lastFailure(), RudIva::Failure::kUnresolvedDirectory);
  EXPECT_EQ(Load("basecell", RudIva::kSynthesisLibraries, "no_such_package"), nullptr);
  EXPECT_EQ(loader_->lastFailure(), RudIva::Failure::kUnitNotFound);
  {
    ScopedEnv unset("CORVANE", nullptr);
    EXPECT_EQ(Load("basecell"), nullptr);
    EXPECT_EQ(loader_->lastFailure(), RudIva::Failure::kUnresolvedDirectory);
  }
  ASSERT_NE(Load("basecell"), nullptr);
  EXPECT_TRUE(loader_->lastError().empty());
}

TEST_F(LibraryLoader, RefusesRequestsForOtherThanAPrimaryPackage) {
  WriteFile("chdp.ini", "basecell=$CORVANE/vhdl/syn/basecell\n");
  EXPECT_EQ(loader_->loadLibUnit("basecell", "vcomponents", "body", RudIva::kPackageObject, 1), nullptr);
  EXPECT_EQ(loader_->loadLibUnit("basecell", "vcomponents", "", RudIva::kPackageObject + 1, 1), nullptr);
  EXPECT_EQ(loader_->loadLibUnit("basecell", "vcomponents", "", RudIva::kPackageObject, 2), nullptr);
  EXPECT_EQ(loader_->loadLibUnit(nullptr, "vcomponents", "", RudIva::kPackageObject, 1), nullptr);
  EXPECT_EQ(loader_->loadLibUnit("basecell", "", "", RudIva::kPackageObject, 1), nullptr);
  EXPECT_EQ(loader_->lastFailure(), RudIva::Failure::kUnsupportedRequest);
  EXPECT_NE(loader_->loadLibUnit("basecell", "vcomponents", nullptr, RudIva::kPackageObject, 1), nullptr);
}

TEST_F(LibraryLoader, ReadsMappingLinesLooselyAndTakesTheFirstMatch) {
  WriteFile("lib_a/cells.vhd", PackageDeclaring("FROM_A"));
  WriteFile("lib_b/cells.vhd", PackageDeclaring("FROM_B"));
  WriteFile("chdp.ini", "[library]\r\n# basecell=lib_b\r\n; basecell=lib_b\r\n" + std::string(10000, 'x') +
                            "\n  BaseCell =  lib_a  \r\nbasecell=lib_b\n");
  EXPECT_EQ(ComponentsOf(Load("basecell")), Names{"FROM_A"}) << "relative to the current directory";
  EXPECT_EQ(ComponentsOf(Load("BASECELL")), Names{"FROM_A"});
}

TEST_F(LibraryLoader, SearchesTheLibrarySourcesInNameOrder) {
  WriteFile("lib/b_second.vhdl", PackageDeclaring("SECOND"));
  WriteFile("lib/c_third.VHO", PackageDeclaring("THIRD"));
  WriteFile("lib/a_first.txt", PackageDeclaring("NOT_VHDL"));
  fs::create_directories("lib/a_directory.vhd");
  WriteFile("lib/a_other.vhd", "package other is end;");
  WriteFile("chdp.ini", "work=lib\n");

  EXPECT_EQ(ComponentsOf(Load("work", 1, "VComponents")), Names{"SECOND"});
  fs::remove("lib/b_second.vhdl");
  EXPECT_EQ(ComponentsOf(Load("work")), Names{"THIRD"});
  EXPECT_NE(Load("work", 1, "other"), nullptr);
}

TEST_F(LibraryLoader, KeepsALoadedUnitUntilItsSourcesChange) {
  WriteFile("lib/cells.vhd", PackageDeclaring("OLD"));
  WriteFile("chdp.ini", "work=lib\n");
  RudIva_Node* first = Load("work");
  ASSERT_NE(first, nullptr);
  EXPECT_EQ(Load("work", 1, "VCOMPONENTS"), first) << "unchanged sources answer the kept unit";

  WriteFile("lib/cells.vhd", PackageDeclaring("NEWER"));
  EXPECT_EQ(ComponentsOf(Load("work")), Names{"NEWER"});
  WriteFile("lib/a_cells.vhd", PackageDeclaring("FIRST"));
  EXPECT_EQ(ComponentsOf(Load("work")), Names{"FIRST"});
}

TEST(LibraryMap, ExpandsSetVariablesAndFindsOnlyWholeMappingLines) {
  ScopedEnv root("QUILLON_TEST_ROOT", "/opt/q");
  ScopedEnv unset("QUILLON_TEST_UNSET", nullptr);
  using RudIva_LibraryMap::ExpandVariables;
  EXPECT_EQ(ExpandVariables("$QUILLON_TEST_ROOT/vhdl"), "/opt/q/vhdl");
  EXPECT_EQ(ExpandVariables("${QUILLON_TEST_ROOT}x/$QUILLON_TEST_ROOT"), "/opt/qx//opt/q");
  EXPECT_EQ(ExpandVariables("cost$/$"), "cost$/$");
  EXPECT_EQ(ExpandVariables("$QUILLON_TEST_UNSET/vhdl"), std::nullopt);
  EXPECT_EQ(ExpandVariables("${QUILLON_TEST_ROOT/vhdl"), std::nullopt);
  EXPECT_EQ(ExpandVariables("${}/vhdl"), std::nullopt);
  std::istringstream empty("");
  EXPECT_EQ(RudIva_LibraryMap::FindDirectory(empty, "basecell"), std::nullopt);
  std::istringstream unrelated("basecell\nbasecells=x\n=y\nbase cell=z");
  EXPECT_EQ(RudIva_LibraryMap::FindDirectory(unrelated, "basecell"), std::nullopt);
  std::istringstream lastLine("ieee=a\nbasecell=b");
  EXPECT_EQ(RudIva_LibraryMap::FindDirectory(lastLine, "basecell"), "b");
}

TEST(VhdlLibraryLoader, ReadsNullNodesSafelyAndListsMembersByKindInOrder) {
  RudIva* loader = RudIva::getPLI();
  EXPECT_EQ(RudIva::getPLI(), loader);
  EXPECT_TRUE(loader->getMembers(nullptr, RudIva::kDeclarationMembers).empty());
  EXPECT_EQ(loader->getName(nullptr), "");
  EXPECT_EQ(loader->getType(nullptr), RudIva::kNoObject);

  RudIva_Node package("vcomponents", RudIva::kPackageObject);
  package.AddMember(RudIva::kDeclarationMembers, "and2", RudIva::kComponentDeclaration);
  package.AddMember(RudIva::kDeclarationMembers + 1, "not_a_declaration", RudIva::kComponentDeclaration);
  package.AddMember(RudIva::kDeclarationMembers, "tied_high", RudIva::kComponentDeclaration + 1);
  std::vector<RudIva_Node*> members = loader->getMembers(&package, RudIva::kDeclarationMembers);
  ASSERT_EQ(members.size(), 2u);
  EXPECT_EQ(loader->getName(members[0]), "and2");
  EXPECT_EQ(loader->getName(members[1]), "tied_high");
  EXPECT_EQ(loader->getType(members[1]), RudIva::kComponentDeclaration + 1);
}
