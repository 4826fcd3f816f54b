// The elaborator's name tables: registration with duplicate renaming, resolution of use clauses,
// instances and primary units, and the table dump.
#include <gtest/gtest.h>

#include "Arch.h"
#include "CompInst.h"
#include "ElabFixtures.h"
#include "EntityDecl.h"
#include "EntityInst.h"
#include "Library.h"
#include "PackageBody.h"
#include "PackageDecl.h"
#include "Port/MsgManData.h"
#include "Use.h"
#include "generic.h"
#include "module.h"

using namespace elab_test;
using Port::StringBase;
using Vad::CElabTables;

namespace {

class Elaborator : public ElabTest {
 protected:
  void SetUp() override {
    ElabTest::SetUp();
    work_ = MakeFile("/src/work.vhd");
    other_ = MakeFile("/src/other.vhd", "lib2");
  }

  CitI::IInterface* Entity(std::string_view name, Vad::IHdlFile* file = nullptr) {
    return Unit<Vad::EntityDecl>(file ? file : work_.Get(), name, nullptr);
  }
  CitI::IInterface* Architecture(std::string_view entity, std::string_view name,
                                 Vad::IHdlFile* file = nullptr) {
    return Unit<Vad::Arch>(file ? file : work_.Get(), entity, name, nullptr);
  }
  CitI::IInterface* Package(std::string_view name, Vad::IHdlFile* file = nullptr) {
    return Unit<Vad::PackageDecl>(file ? file : work_.Get(), name, nullptr);
  }
  CitI::IInterface* Module(std::string_view name) { return Unit<Vad::module>(work_.Get(), name, nullptr); }

  static void EntityInstance(CitI::IInterface* parent, std::string_view label, std::string_view entity,
                             std::string_view architecture) {
    Prjrep::AutoRelease<CitI::IInterface> made(new Vad::EntityInst(label, RecordOf<Vad::DbObject>(parent)));
    auto* record = RecordOf<Vad::EntityInst>(made.Get());
    record->SetLabel(label);
    record->SetEntityName(entity);
    record->SetArchitectureName(architecture);
  }

  // Registration and processing of `units`, as Elaborate runs them.
  CitI::Result Resolve(const std::vector<CitI::IInterface*>& units) {
    auto iterator = IterateUnits(units);
    CitI::Result result = elaborator_.RegisterDesignUnits(tables_, iterator.Get(), duplicates_);
    if (result != CitI::kOk) return result;
    for (const auto& [name, element] : tables_.m_piHdlElementMultiMapNames) {
      result = elaborator_.ProcessElement(tables_, name, element);
      if (result != CitI::kOk) return result;
    }
    return CitI::kOk;
  }

  std::vector<std::string> RegisteredNames() const {
    std::vector<std::string> names;
    for (const auto& entry : tables_.m_piHdlElementMultiMapNames) names.push_back(entry.first.str());
    return names;
  }
  std::vector<std::string> Depends(std::string_view name) const {
    std::vector<std::string> texts;
    if (auto* list = elaborator_.FindDepends(tables_, StringBase(name)))
      for (const StringBase& text : *list) texts.push_back(text.str());
    return texts;
  }
  std::vector<std::string> Labels(std::string_view name) const {
    std::vector<std::string> texts;
    if (auto* list = elaborator_.FindInstanceLabels(tables_, StringBase(name)))
      for (const StringBase& text : *list) texts.push_back(text.str());
    return texts;
  }
  long Count(std::string_view name) const {
    auto found = tables_.m_ElementNameDependencyCountMap.find(StringBase(name));
    return found == tables_.m_ElementNameDependencyCountMap.end() ? -1 : static_cast<long>(found->second);
  }

  Prjrep::AutoPtr<Vad::IHdlFile> work_;
  Prjrep::AutoPtr<Vad::IHdlFile> other_;
  Prjrep::AutoRelease<Vad::CElaborator> elaboratorObject_{new Vad::CElaborator()};
  Vad::CElaborator& elaborator_ = *elaboratorObject_.Get();
  CElabTables tables_;
  Vad::DuplicateList duplicates_;
};

TEST_F(Elaborator, SecondEntityOfALibraryIsRenamedAsDuplicate) {
  CitI::IInterface* first = Entity("dup");
  CitI::IInterface* second = Entity("DUP");
  CitI::IInterface* elsewhere = Entity("dup", other_.Get());
  ASSERT_EQ(Resolve({first, second, elsewhere}), CitI::kOk);

  // Entities compare without regard to case; the other library's entity is no duplicate.
  EXPECT_EQ(RegisteredNames(), (std::vector<std::string>{"Entity|dup", "Entity|dup",
                                                         "Entity|DUP****DUPLICATE_1_DUPLICATE****"}));
  ASSERT_EQ(duplicates_.size(), 1u);
  EXPECT_EQ(duplicates_[0], ElementOf(second));
  EXPECT_EQ(Count("work:Entity|DUP****DUPLICATE_1_DUPLICATE****"), 0);
  EXPECT_EQ(Count("lib2:Entity|dup"), 0);
  // Its short key carries the suffix too, so it gets an entry of its own.
  EXPECT_EQ(tables_.m_sArchitectureMultiMapList.count(StringBase("Entity|DUP****DUPLICATE_1_DUPLICATE****")),
            1u);
}

TEST_F(Elaborator, ModulesDifferingInCaseAreNoDuplicates) {
  ASSERT_EQ(Resolve({Module("top"), Module("TOP"), Module("top")}), CitI::kOk);
  EXPECT_EQ(RegisteredNames(), (std::vector<std::string>{"Module|top", "Module|TOP",
                                                         "Module|top****DUPLICATE_1_DUPLICATE****"}));
  EXPECT_EQ(Count("work:Module|TOP"), 0);
}

TEST_F(Elaborator, VhdlNamesResolveWithoutCaseExceptExtendedIdentifiers) {
  CitI::IInterface* folded = Entity("\\Dup\\");
  CitI::IInterface* exact = Entity("\\DUP\\");
  CitI::IInterface* package = Package("My_Pkg");
  CitI::IInterface* table = Package("\\Tab\\");
  CitI::IInterface* user = Entity("user");
  Uses(user, "WORK.my_pkg.all");
  Uses(user, "work.\\TAB\\.all");
  Uses(user, "work.\\Tab\\.all");
  ASSERT_EQ(Resolve({folded, exact, package, table, user}), CitI::kOk);

  EXPECT_TRUE(duplicates_.empty());
  EXPECT_EQ(Depends("work:Entity|user"),
            (std::vector<std::string>{"work:PackageDecl|My_Pkg", "work:PackageDecl|\\TAB\\",
                                      "work:PackageDecl|\\Tab\\"}));
  EXPECT_EQ(Count("work:PackageDecl|My_Pkg"), 1);
  EXPECT_EQ(Count("work:PackageDecl|\\Tab\\"), 1);
}

TEST_F(Elaborator, EveryArchitectureIsRegisteredWithTheOneAnalysedLastFirst) {
  // A file given earlier has the larger order key (work.vhd has 0), so it is analysed first.
  auto early = MakeFile("/src/early.vhd", "work", "PLUGIN_Vhdl", 5);
  CitI::IInterface* two = Architecture("SUB", "two", early.Get());
  CitI::IInterface* one = Architecture("sub", "one");
  CitI::IInterface* top = Architecture("top", "rtl");
  EntityInstance(top, "u_any", "work.sub", "");
  EntityInstance(top, "u_two", "sub", "two");
  EntityInstance(top, "u_one", "sub", "ONE");
  ASSERT_EQ(Resolve({two, one, top}), CitI::kOk);

  auto* keys = elaborator_.FindRegisteredKey(tables_, "Architecture|Sub", "work", true);
  ASSERT_NE(keys, nullptr);
  EXPECT_EQ(*keys, (std::vector<StringBase>{"work:Architecture|sub|one", "work:Architecture|SUB|two"}));
  // Without an architecture the default is taken; a named one resolves whatever its position.
  EXPECT_EQ(Depends("work:Architecture|top|rtl"),
            (std::vector<std::string>{"work:Architecture|sub|one", "work:Architecture|SUB|two",
                                      "work:Architecture|sub|one", "work:Entity|top"}));
  EXPECT_EQ(Labels("work:Architecture|top|rtl"), (std::vector<std::string>{"u_any", "u_two", "u_one"}));
  EXPECT_EQ(Count("work:Architecture|sub|one"), 2);
  EXPECT_EQ(Count("work:Architecture|SUB|two"), 1);
}

TEST_F(Elaborator, UseClausesFollowProjectPackagesOnly) {
  CitI::IInterface* package = Package("pkg");
  CitI::IInterface* foreign = Package("pkg2", other_.Get());
  CitI::IInterface* entity = Entity("e");
  Uses(entity, "ieee.std_logic_1164.all");
  Uses(entity, "basecell.vcomponents.all");
  Uses(entity, "work.pkg.all");
  Uses(entity, "lib2.pkg2.all");
  Uses(entity, "work.pkg");
  Uses(entity, "work.nowhere.all");
  ASSERT_EQ(Resolve({package, foreign, entity}), CitI::kOk);

  EXPECT_EQ(Depends("work:Entity|e"),
            (std::vector<std::string>{"work:PackageDecl|pkg", "lib2:PackageDecl|pkg2", "work:PackageDecl|pkg",
                                      "work:PackageDecl|nowhere"}));
  EXPECT_EQ(Labels("work:Entity|e"), (std::vector<std::string>(4, "")));
  EXPECT_EQ(Count("work:PackageDecl|pkg"), 2);
  EXPECT_EQ(Count("lib2:PackageDecl|pkg2"), 1);
  EXPECT_EQ(Count("work:PackageDecl|nowhere"), -1);
}

TEST_F(Elaborator, InstancesRecordTargetsLabelsAndInstanceElements) {
  CitI::IInterface* sub = Architecture("sub", "rtl");
  CitI::IInterface* top = Architecture("top", "rtl");
  Vad::CompInst* first = Component(top, "u1", "sub");
  Vad::CompInst* again = Component(top, "u1", "sub");
  Component(top, "u_cell", "basecell.QL_INV");
  Component(top, "u_ghost", "ghost");
  EntityInstance(top, "u_lib", "mylib.block", "");
  ASSERT_EQ(Resolve({sub, top}), CitI::kOk);

  EXPECT_EQ(Depends("work:Architecture|top|rtl"),
            (std::vector<std::string>{"work:Architecture|sub|rtl", "work:Architecture|sub|rtl",
                                      "work:Architecture|basecell.QL_INV", "work:Architecture|ghost",
                                      "work:Architecture|mylib.block|", "work:Entity|top"}));
  EXPECT_EQ(Labels("work:Architecture|top|rtl"),
            (std::vector<std::string>{"u1", "u1", "u_cell", "u_ghost", "u_lib"}));
  EXPECT_EQ(Count("work:Architecture|sub|rtl"), 2);
  EXPECT_EQ(Count("work:Architecture|ghost"), -1);
  // The first instance stored under a key stays.
  auto stored = tables_.m_IHdlElementInstanceNameMap.find(
      StringBase("work:Architecture|top|rtl|work:Architecture|sub|rtl|u1"));
  ASSERT_NE(stored, tables_.m_IHdlElementInstanceNameMap.end());
  EXPECT_EQ(stored->second, ElementOf(first));
  EXPECT_NE(stored->second, ElementOf(again));
  // The primary unit gets an entry in the instance lists as well.
  EXPECT_EQ(Labels("work:Entity|top"), std::vector<std::string>{""});
  EXPECT_EQ(Count("work:Entity|top"), -1);
}

TEST_F(Elaborator, ModuleInstancesOfTheVerilogParserResolveToModules) {
  CitI::IInterface* leaf = Module("leaf");
  CitI::IInterface* top = Module("top");
  Vad::CompInst* instance = Component(top, "u_leaf", "leaf");
  instance->SetDesignUnitTypeId(Port::XUID(std::string_view("{4767A2DD-D3AE-4b52-9042-59EAAF25C023}")));
  Component(top, "u_vhdl", "leaf");
  ASSERT_EQ(Resolve({leaf, top}), CitI::kOk);
  // A VHDL-style instance of a module still finds it, through the entity fallback.
  EXPECT_EQ(Depends("work:Module|top"), (std::vector<std::string>{"work:Module|leaf", "work:Module|leaf"}));
  EXPECT_EQ(Count("work:Module|leaf"), 2);
}

TEST_F(Elaborator, PrimaryUnitsAreReferencedByArchitecturesAndBodies) {
  CitI::IInterface* body = Unit<Vad::PackageBody>(work_.Get(), "pkg", nullptr);
  CitI::IInterface* orphan = Unit<Vad::PackageBody>(work_.Get(), "lonely", nullptr);
  ASSERT_EQ(Resolve({Package("pkg"), body, orphan, Entity("e"), Architecture("e", "rtl")}), CitI::kOk);
  EXPECT_EQ(Depends("work:PackageBody|pkg"), std::vector<std::string>{"work:PackageDecl|pkg"});
  EXPECT_EQ(Depends("work:PackageBody|lonely"), std::vector<std::string>{"work:PackageDecl|lonely"});
  EXPECT_EQ(Count("work:PackageDecl|pkg"), 1);
  EXPECT_EQ(Count("work:Entity|e"), 1);
  EXPECT_EQ(Count("work:Architecture|e|rtl"), 0);
}

TEST_F(Elaborator, GenericsAreNotRegisteredAndUnitsOfAnUnknownKindGetTheUnknownLabel) {
  CitI::IInterface* width = Unit<Vad::generic>(work_.Get(), "WIDTH", nullptr);
  CitI::IInterface* library = Unit<Vad::Library>(work_.Get(), "ieee", nullptr);
  ASSERT_EQ(Resolve({width, library, Entity("e")}), CitI::kOk);
  EXPECT_EQ(RegisteredNames(), (std::vector<std::string>{"Entity|e", "Library"}));
  EXPECT_EQ(Labels("work:Library"), std::vector<std::string>{Vad::ElabText::kUnknownType});
  EXPECT_EQ(tables_.m_sArchitectureMultiMapList.size(), 1u);
}

TEST_F(Elaborator, ExistingCountNameKeepsItsCountAndTellsTheDeveloper) {
  Port_DebugCapture debug;
  ASSERT_EQ(elaborator_.AddDependencyCountName(tables_, "work:Entity|e"), CitI::kOk);
  tables_.m_ElementNameDependencyCountMap[StringBase("work:Entity|e")] = 4;
  EXPECT_TRUE(debug.text().empty());
  ASSERT_EQ(elaborator_.AddDependencyCountName(tables_, "work:Entity|e"), CitI::kOk);
  EXPECT_EQ(Count("work:Entity|e"), 4);
  EXPECT_EQ(debug.text(), Vad::ElabText::kNameExists);
  EXPECT_EQ(elaborator_.AddDependencyCountName(tables_, ""), CitI::kInvalidArg);
}

TEST_F(Elaborator, ProcessingAUnitTwiceIsReportedAndDoneAgain) {
  CitI::IInterface* entity = Entity("e");
  Uses(entity, "work.pkg.all");
  MessageLog messages;
  ASSERT_EQ(elaborator_.ProcessElement(tables_, "Entity|e", ElementOf(entity)), CitI::kOk);
  EXPECT_TRUE(messages.Records().empty());
  ASSERT_EQ(elaborator_.ProcessElement(tables_, "Entity|e", ElementOf(entity)), CitI::kOk);
  StringBase expected;
  expected.Format(Vad::ElabText::kDuplicateName, "Entity|e");
  EXPECT_EQ(messages.Texts(Port_MsgMan::kInfo), std::vector<std::string>{expected.str()});
  EXPECT_EQ(Depends("work:Entity|e").size(), 2u);
  EXPECT_EQ(elaborator_.ProcessElement(tables_, "Entity|e", nullptr), CitI::kInvalidArg);
}

TEST_F(Elaborator, FindsElementsByQualifiedKeyInTheirLibraryOnly) {
  CitI::IInterface* mine = Entity("e");
  CitI::IInterface* theirs = Entity("f", other_.Get());
  CitI::IInterface* module = Module("m");
  ASSERT_EQ(Resolve({mine, theirs, module}), CitI::kOk);
  Vad::IHdlElement* found = nullptr;
  EXPECT_EQ(elaborator_.FindElementByKey(tables_, "Entity|e", true, &found), CitI::kOk);
  EXPECT_EQ(found, ElementOf(mine));
  EXPECT_EQ(elaborator_.FindElementByKey(tables_, "lib2:Entity|f", true, &found), CitI::kOk);
  EXPECT_EQ(found, ElementOf(theirs));
  EXPECT_EQ(elaborator_.FindElementByKey(tables_, "work:Entity|f", true, &found), CitI::kOk);
  EXPECT_EQ(found, nullptr);
  // An exact look-up follows each language: VHDL names without case, Verilog names with it.
  EXPECT_EQ(elaborator_.FindElementByKey(tables_, "work:Entity|E", true, &found), CitI::kOk);
  EXPECT_EQ(found, ElementOf(mine));
  EXPECT_EQ(elaborator_.FindElementByKey(tables_, "work:Module|M", true, &found), CitI::kOk);
  EXPECT_EQ(found, nullptr);
  EXPECT_EQ(elaborator_.FindElementByKey(tables_, "work:Module|M", false, &found), CitI::kOk);
  EXPECT_EQ(found, ElementOf(module));
  EXPECT_EQ(elaborator_.FindElementByKey(tables_, "", true, &found), CitI::kInvalidArg);
  EXPECT_EQ(elaborator_.FindElementByKey(tables_, "Entity|e", true, nullptr), CitI::kInvalidArg);
}

TEST_F(Elaborator, SplitsQualifiedAndDottedNamesAtTheirLastSeparator) {
  StringBase library;
  StringBase key;
  Vad::CElaborator::SplitQualifiedName("work:Entity|e", library, key);
  EXPECT_EQ(library, "work");
  EXPECT_EQ(key, "Entity|e");
  Vad::CElaborator::SplitQualifiedName("Entity|e", library, key);
  EXPECT_EQ(library, "");
  EXPECT_EQ(key, "Entity|e");
  Vad::CElaborator::SplitDottedName("a.b.c", library, key);
  EXPECT_EQ(library, "b");
  EXPECT_EQ(key, "c");
  EXPECT_EQ(Vad::CElaborator::Qualify("", "Entity|e"), "Entity|e");
  EXPECT_EQ(Vad::CElaborator::Qualify("lib", "Entity|e"), "lib:Entity|e");
}

TEST_F(Elaborator, DumpShowsTheTablesEntries) {
  CitI::IInterface* arch = Architecture("e", "rtl");
  Component(arch, "u1", "sub")->SetProperty("PARTITION", "P1");
  ASSERT_EQ(Resolve({Entity("e"), arch}), CitI::kOk);
  testing::internal::CaptureStdout();
  elaborator_.DumpTables(tables_);
  std::string dump = testing::internal::GetCapturedStdout();
  for (const char* entry :
       {"  Entity|e -- work\n   work:Entity|e\n", "  work:Entity|e\n   \n",
        "work:Architecture|e|rtl|work:Architecture|sub|u1, Prop: P1, Ptr: ", "  work:Entity|e -- 1\n",
        "    work:Architecture|sub\n    work:Entity|e\n", "  work - Entity|e Ptr: "})
    EXPECT_NE(dump.find(entry), std::string::npos) << entry;
}

TEST_F(Elaborator, ElaborateNeedsItsArgumentsAndLibraryReferences) {
  auto none = IterateUnits({});
  Vad::CLibRefs* references = References();
  Prjrep::AutoPtr<Vad::IHdlNetListNode> root;
  EXPECT_EQ(elaborator_.Elaborate(nullptr, none.Get(), root.Out()), CitI::kInvalidArg);
  EXPECT_EQ(elaborator_.Elaborate(references, nullptr, root.Out()), CitI::kInvalidArg);
  EXPECT_EQ(elaborator_.Elaborate(references, none.Get(), nullptr), CitI::kInvalidArg);
  EXPECT_FALSE(root);

  ASSERT_EQ(elaborator_.Elaborate(references, none.Get(), root.Out()), CitI::kOk);
  ASSERT_TRUE(root);
  EXPECT_TRUE(ChildrenOf(root.Get()).empty());
  EXPECT_EQ(Prjrep::RefCountOf(root.Get()), 1u);
}

}  // namespace
