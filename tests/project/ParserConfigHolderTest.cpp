#include <gtest/gtest.h>

#include "Arch.h"
#include "CompInst.h"
#include "EntityDecl.h"
#include "EntityInst.h"
#include "Library.h"
#include "PackageDecl.h"
#include "Prjrep/TListIter.h"
#include "TestHost.h"
#include "Use.h"
#include "module.h"

using namespace test_host;
using Vad::CParserConfigHolder;

namespace {

const Port::XUID kType{std::string_view("{0CBD7350-BC55-49c4-84AD-BBF6684DF5A8}")};
const Port::XUID kInstanceType{std::string_view("{A192BA7E-ECE8-46e2-84A5-A90A1CFA1D35}")};

class Holder : public PipelineTest {
 protected:
  void SetUp() override {
    project_ = NewProject();
    file_ = AddNewFile(project_.Get(), "/proj/src/counter.vhd", "PLUGIN_Vhdl");
    holder_ = HolderOf(file_.Get());
    ASSERT_NE(holder_, nullptr);
    holder_->BeginParse(nullptr);
  }

  std::vector<std::string> UseKeysOf(Vad::CVhdlDU* unit) {
    std::vector<Vad::DbObject*> uses;
    unit->GetUses(uses);
    std::vector<std::string> keys;
    for (Vad::DbObject* use : uses) keys.push_back(use->GetKey().str());
    return keys;
  }

  Vad::CHdlElement* Recorded(std::string_view key) { return holder_->FindRecorded(Port::StringBase(key)); }

  static Vad::IHdlFileIterator* ListOf(Prjrep::AutoRelease<Vad::IHdlFileIterator>& keep,
                                       std::vector<Vad::IHdlFile*> files) {
    keep = Prjrep::TInterfaceListIter<Vad::IHdlFileIterator>::New(files);
    return keep.Get();
  }

  Prjrep::AutoPtr<Vad::IHdlProject> project_;
  Prjrep::AutoPtr<Vad::IHdlFile> file_;
  CParserConfigHolder* holder_ = nullptr;
};

TEST_F(Holder, QueriesAnswerFromTheFileItsLibraryAndItsProjectConfiguration) {
  const auto answers = [&] {
    std::vector<std::string> texts;
    for (auto query : {&CParserConfigHolder::GetFullPath, &CParserConfigHolder::GetBaseName,
                       &CParserConfigHolder::GetExtension, &CParserConfigHolder::GetFileName,
                       &CParserConfigHolder::GetPluginName, &CParserConfigHolder::GetLibraryName}) {
      Port::StringBase text = "stale";
      (holder_->*query)(text);
      texts.push_back(text.str());
    }
    return texts;
  };
  EXPECT_EQ(answers(), (std::vector<std::string>{"/proj/src/counter.vhd", "counter", "vhd", "counter.vhd",
                                                 "PLUGIN_Vhdl", "work"}));
  SetLibrary(file_.Get(), "ip_lib");
  EXPECT_EQ(answers().back(), "ip_lib");

  Port::StringBase text;
  SetProperty(project_.Get(), "PROP_Parse_Target", "synthesis");
  EXPECT_EQ(holder_->GetProperty("PROP_Parse_Target", text), CitI::kOk);
  EXPECT_EQ(text, "synthesis");
  EXPECT_EQ(holder_->GetProperty("PROP_Missing", text), CitI::kOk);
  EXPECT_EQ(text, "");
  EXPECT_NE(holder_->GetLibRefs(), nullptr);
  EXPECT_EQ(holder_->TypeName(), std::string("CParserConfigHolder"));
}

TEST_F(Holder, WithoutAProjectTheFileHasNoConfigurationAndNoLibraryReferences) {
  auto loose = NewFile(project_.Get(), "/proj/loose.vhd", "PLUGIN_Vhdl");
  CParserConfigHolder* holder = HolderOf(loose.Get());
  Port::StringBase value = "old";
  EXPECT_EQ(holder->GetProperty("PROP_Parse_Target", value), CitI::kFail);
  EXPECT_EQ(value, "");
  EXPECT_EQ(holder->GetLibRefs(), nullptr);
  bool valid = true;
  EXPECT_EQ(holder->IsUpToDate(&valid, nullptr), CitI::kOk);
  EXPECT_FALSE(valid);
}

TEST_F(Holder, RecordsAVhdlFileWithItsContextInstancesBindingsAndDuplicates) {
  Vad::Library* ieee = holder_->AddLibrary("ieee", 1, kType);
  ASSERT_NE(ieee, nullptr);
  EXPECT_EQ(holder_->AddLibrary("ieee", 30, kType), ieee);  // same key: the first record is kept
  holder_->AddUse("ieee.std_logic_1164.all", 2, kType, false);
  Vad::EntityDecl* entity = holder_->AddEntityDecl("counter", 4, true, kType);
  ASSERT_NE(entity, nullptr);
  EXPECT_TRUE(entity->GetUnitFlag());
  EXPECT_EQ(UseKeysOf(entity), std::vector<std::string>{"||Use|ieee|std_logic_1164|all|"});
  holder_->SetEntityPortFlag(false);
  EXPECT_FALSE(entity->GetUnitFlag());

  Vad::Arch* rtl = holder_->AddArch("rtl", "counter", 10, kType);
  ASSERT_NE(rtl, nullptr);
  EXPECT_TRUE(UseKeysOf(rtl).empty());                // the entity took the pending context
  holder_->AddUse("work.pkg.all", 11, kType, false);  // in the architecture's declarations
  EXPECT_EQ(UseKeysOf(rtl), std::vector<std::string>{"||Use|work|pkg|all|"});

  Vad::CompInst* u1 = holder_->AddCompInst("u1", "adder", 13, kInstanceType, "");
  ASSERT_NE(u1, nullptr);
  EXPECT_EQ(u1->GetParent(), rtl);
  EXPECT_FALSE(u1->IsInGenerate());
  holder_->EnterGenerate();
  holder_->EnterGenerate();
  holder_->LeaveGenerate(false);
  Vad::CompInst* unlabeled = holder_->AddCompInst("", "adder", 15, kInstanceType, "p1");
  ASSERT_NE(unlabeled, nullptr);
  EXPECT_TRUE(unlabeled->IsInGenerate());
  EXPECT_EQ(unlabeled->GetLabel(), "adder");
  Port::StringBase partition;
  unlabeled->GetProperty("PARTITION", partition);
  EXPECT_EQ(partition, "p1");
  holder_->LeaveGenerate(false);
  holder_->LeaveGenerate(false);  // never below 0
  Vad::CompInst* again = holder_->AddCompInst("u1", "adder", 17, kInstanceType, "");
  ASSERT_NE(again, nullptr);
  EXPECT_FALSE(again->IsInGenerate());

  // Only "all" without an architecture binds the component to an entity.
  holder_->AddConfigBinding("u9", "sub", "sub_e", "");
  holder_->AddConfigBinding("all", "sub", "sub_e", "fast");
  holder_->AddConfigBinding("ALL", "adder", "adder_e", "");
  EXPECT_EQ(holder_->AddCompInst("u3", "adder", 19, kInstanceType, ""), nullptr);
  EXPECT_NE(holder_->AddCompInst("u4", "sub", 20, kInstanceType, ""), nullptr);

  // A use clause in the body waits for the next unit; until then instances have no parent, and
  // an instance empties the waiting context.
  holder_->AddUse("work.more.all", 21, kType, true);
  EXPECT_EQ(holder_->AddCompInst("u5", "adder", 22, kInstanceType, ""), nullptr);
  holder_->AddUse("work.other.all", 23, kType, true);
  Vad::PackageDecl* package = holder_->AddPackageDecl("types", 24, kType);
  ASSERT_NE(package, nullptr);
  EXPECT_EQ(UseKeysOf(package), std::vector<std::string>{"||Use|work|other|all|"});
  EXPECT_EQ(holder_->AddCompInst("u6", "adder", 25, kInstanceType, ""), nullptr);  // a package is no parent
  Vad::EntityDecl* twin = holder_->AddEntityDecl("counter", 27, false, kType);
  ASSERT_NE(twin, nullptr);
  EXPECT_TRUE(UseKeysOf(twin).empty());
  ASSERT_NE(holder_->AddEntityDecl("counter", 29, false, kType), nullptr);

  EXPECT_EQ(Recorded("|Entity||counter"), entity);
  EXPECT_EQ(Recorded("|Entity||counter-Instance(1)"), twin);
  ASSERT_NE(Recorded("|Entity||counter-Instance(2)"), nullptr);
  EXPECT_EQ(Recorded("|Entity||counter-Instance(2)")->GetLine(), 29u);
  EXPECT_EQ(Recorded("|ComponentInstantiation||counter|rtl|u1|adder|-Instance(1)"), again);
  auto* bound = dynamic_cast<Vad::EntityInst*>(Recorded("|EntityInstantiation||counter|rtl|u3|adder_e||"));
  ASSERT_NE(bound, nullptr);
  EXPECT_EQ(bound->GetLine(), 19u);
  EXPECT_EQ(bound->GetDesignUnitTypeId(), kInstanceType);

  holder_->EndParse();
  // In key order; the duplicates keep their own store keys.
  EXPECT_EQ(FileUnitKeys(file_.Get()), (std::vector<std::string>{
                                           "|Architecture||rtl|counter||",
                                           "|ComponentInstantiation||counter|rtl|adder|adder|",
                                           "|ComponentInstantiation||counter|rtl|u1|adder|",
                                           "|ComponentInstantiation||counter|rtl|u1|adder|",
                                           "|ComponentInstantiation||counter|rtl|u4|sub|",
                                           "|EntityInstantiation||counter|rtl|u3|adder_e||",
                                           "|Entity||counter",
                                           "|Entity||counter",
                                           "|Entity||counter",
                                           "|PackageDecl||types|",
                                           "||Library|ieee|",
                                           "||Use|ieee|std_logic_1164|all|",
                                           "||Use|work|more|all|",
                                           "||Use|work|other|all|",
                                           "||Use|work|pkg|all|",
                                       }));
  EXPECT_EQ(holder_->GetUnitCount(), 15u);
  EXPECT_EQ(entity->GetLine(), 4u);
  EXPECT_EQ(entity->GetDesignUnitTypeId(), kType);
  Prjrep::AutoRelease<CitI::IInterface> recordedFile;
  EXPECT_EQ(entity->GetFileObject(recordedFile.Out()), CitI::kOk);
  EXPECT_EQ(Prjrep::ObjectCast<Vad::CHdlFile>(recordedFile.Get()), FileObject(file_.Get()));
}

TEST_F(Holder, BindingsAndUnitStateEndWithTheUnitAndOutsideVhdlBindingsDoNothing) {
  holder_->AddEntityDecl("top", 1, false, kType);
  holder_->AddArch("rtl", "top", 2, kType);
  holder_->AddConfigBinding("all", "adder", "adder_e", "");
  holder_->EnterGenerate();
  holder_->AddArch("alt", "top", 9, kType);
  Vad::CompInst* instance = holder_->AddCompInst("u1", "adder", 10, kInstanceType, "");
  ASSERT_NE(instance, nullptr);
  EXPECT_FALSE(instance->IsInGenerate());

  file_->setPluginName("PLUGIN_Hrf");
  holder_->AddConfigBinding("all", "adder", "adder_e", "");
  EXPECT_NE(holder_->AddCompInst("u2", "adder", 11, kInstanceType, ""), nullptr);
}

TEST_F(Holder, FirstInstanceLabelRenamesLaterOnesCopy) {
  file_->setPluginName("PLUGIN_Hrf");
  Vad::module* top = holder_->AddModule("top", 1, false, kType, "");
  ASSERT_NE(top, nullptr);
  // Registered second under a duplicate key, then renamed: the first one stays where it was.
  Vad::CompInst* first = holder_->AddCompInst("i1", "cell", 2, kInstanceType, "");
  Vad::CompInst* duplicate = holder_->AddCompInst("i1", "cell", 3, kInstanceType, "");
  holder_->AddInstanceLabel("a");
  holder_->AddInstanceLabel("b");
  holder_->AddInstanceLabel("c");
  EXPECT_EQ(duplicate->GetLabel(), "a");
  EXPECT_EQ(Recorded("|ComponentInstantiation||top|top|i1|cell|"), first);
  EXPECT_EQ(Recorded("|ComponentInstantiation||top|top|a|cell|"), duplicate);
  EXPECT_EQ(Recorded("|ComponentInstantiation||top|top|i1|cell|-Instance(1)"), nullptr);
  for (std::string_view copy : {"b", "c"}) {
    auto* instance = dynamic_cast<Vad::CompInst*>(
        Recorded("|ComponentInstantiation||top|top|" + std::string(copy) + "|cell|"));
    ASSERT_NE(instance, nullptr) << copy;
    EXPECT_EQ(instance->GetLine(), 3u);
    EXPECT_EQ(instance->GetDesignUnitTypeId(), kInstanceType);
    EXPECT_EQ(instance->GetParent(), top);
  }

  Vad::EntityInst* entityInstance = holder_->AddEntityInst("e1", "ent", "fast", 5, kInstanceType);
  ASSERT_NE(entityInstance, nullptr);
  holder_->AddInstanceLabel("x");
  holder_->AddInstanceLabel("y");
  EXPECT_EQ(entityInstance->GetLabel(), "x");
  auto* copy = dynamic_cast<Vad::EntityInst*>(
      Recorded("|EntityInstantiation||INVALID_PARENT_ENTITY|INVALID_PARENT_ARCHITECT|y|ent||fast"));
  ASSERT_NE(copy, nullptr);
  EXPECT_EQ(copy->GetLine(), 5u);
  holder_->EndParse();
  EXPECT_EQ(holder_->GetUnitCount(), 7u);
}

TEST_F(Holder, TestVectorsRecordAModuleWithOneInstanceAndFlagTheCurrentUnit) {
  Vad::EntityDecl* entity = holder_->AddEntityDecl("dut", 1, false, kType);
  holder_->AddTestVector("tv1");
  EXPECT_TRUE(entity->GetUnitFlag());
  auto* vectors = dynamic_cast<Vad::module*>(Recorded("|Module||tv1"));
  ASSERT_NE(vectors, nullptr);
  EXPECT_EQ(vectors->GetModuleName(), "tv1_TestVector");
  EXPECT_EQ(vectors->GetLine(), 0u);
  EXPECT_FALSE(vectors->GetUnitFlag());
  EXPECT_EQ(vectors->GetDesignUnitTypeId(), CParserConfigHolder::DefaultTypeIds()[6]);
  auto* instance = dynamic_cast<Vad::CompInst*>(
      Recorded("|ComponentInstantiation||tv1_TestVector|tv1_TestVector|tv1|tv1|"));
  ASSERT_NE(instance, nullptr);
  EXPECT_EQ(instance->GetParent(), vectors);
  EXPECT_EQ(instance->GetDesignUnitTypeId(), CParserConfigHolder::DefaultTypeIds()[5]);
  // The test-vector module does not become the current unit.
  Vad::CompInst* inEntity = holder_->AddCompInst("u1", "cell", 3, kInstanceType, "");
  ASSERT_NE(inEntity, nullptr);
  EXPECT_EQ(inEntity->GetParent(), entity);
}

TEST_F(Holder, NoneSlotsDisableTheirKindsWithoutAnyMessage) {
  CParserConfigHolder::TypeIds ids = CParserConfigHolder::DefaultTypeIds();
  for (int slot : {0, 2, 5, 6}) ids[slot] = CParserConfigHolder::NoneTypeId();
  holder_->SetTypeIds(ids);
  EXPECT_EQ(holder_->GetTypeId(CParserConfigHolder::kEntitySlot), CParserConfigHolder::NoneTypeId());

  Vad::Arch* rtl = holder_->AddArch("rtl", "top", 1, kType);
  ASSERT_NE(rtl, nullptr);
  holder_->EnterGenerate();
  // A disabled module changes nothing: the architecture stays current, the generate stays open.
  EXPECT_EQ(holder_->AddModule("m", 2, true, kType, ""), nullptr);
  Vad::CompInst* instance = holder_->AddCompInst("u1", "cell", 3, kInstanceType, "");
  ASSERT_NE(instance, nullptr);
  EXPECT_TRUE(instance->IsInGenerate());
  holder_->AddInstanceLabel("renamed");
  EXPECT_EQ(instance->GetLabel(), "u1");
  holder_->AddTestVector("tv");
  EXPECT_FALSE(rtl->GetUnitFlag());
  EXPECT_EQ(holder_->AddEntityDecl("top", 4, true, kType), nullptr);

  holder_->EndParse();
  EXPECT_EQ(
      FileUnitKeys(file_.Get()),
      (std::vector<std::string>{"|Architecture||rtl|top||", "|ComponentInstantiation||top|rtl|u1|cell|"}));
  // The slots keep their values across parses.
  holder_->BeginParse(nullptr);
  EXPECT_EQ(holder_->AddModule("m", 2, true, kType, ""), nullptr);
}

TEST_F(Holder, ModulesDropThePendingContextAndKeepTheirPartition) {
  holder_->AddUse("work.pkg.all", 1, kType, false);
  Vad::module* unit = holder_->AddModule("top", 2, true, kType, "part_a");
  ASSERT_NE(unit, nullptr);
  Port::StringBase partition;
  EXPECT_EQ(unit->GetProperty("PARTITION", partition), CitI::kOk);
  EXPECT_EQ(partition, "part_a");
  EXPECT_TRUE(unit->GetUnitFlag());
  Vad::EntityDecl* entity = holder_->AddEntityDecl("next", 3, false, kType);
  EXPECT_TRUE(UseKeysOf(entity).empty());
}

TEST_F(Holder, RegisterUnitRefusesAnEmptyKey) {
  Vad::EntityDecl* entity = holder_->AddEntityDecl("e", 1, false, kType);
  EXPECT_FALSE(holder_->RegisterUnit("", entity));
  EXPECT_TRUE(holder_->RegisterUnit("custom", entity));
  EXPECT_TRUE(holder_->RegisterUnit("custom", entity));
  EXPECT_EQ(Recorded("custom-Instance(1)"), entity);
}

TEST_F(Holder, ANewParseStartsFromNothingAndForgetsTheLastUnits) {
  holder_->AddUse("work.a.all", 1, kType, true);
  holder_->EndParse();
  holder_->BeginParse(nullptr);
  Vad::EntityDecl* entity = holder_->AddEntityDecl("top", 2, false, kType);
  EXPECT_TRUE(UseKeysOf(entity).empty());  // the last parse's pending use is gone

  holder_->AddArch("rtl", "top", 3, kType);
  holder_->EndParse();
  holder_->BeginParse(nullptr);
  EXPECT_EQ(holder_->AddCompInst("u1", "cell", 1, kInstanceType, ""), nullptr);  // no unit carries over
  holder_->AddGeneric("WIDTH", 1, kType);
  holder_->EndParse();
  EXPECT_EQ(FileUnitKeys(file_.Get()), std::vector<std::string>{"|Generic||WIDTH"});
}

TEST_F(Holder, UpToDateFollowsSignatureLibraryAndSiblingFilesInOrder) {
  auto other = AddNewFile(project_.Get(), "/proj/src/other.vhd", "plugin_VHDL");
  auto verilog = AddNewFile(project_.Get(), "/proj/src/top.v", "PLUGIN_Verilog");
  SetProperty(project_.Get(), "PROP_Parse_Target", "synthesis");
  Prjrep::AutoRelease<Vad::IHdlFileIterator> list;
  holder_->BeginParse(ListOf(list, {other.Get(), verilog.Get(), file_.Get()}));
  EXPECT_EQ(holder_->GetSiblingPaths().Paths(),
            (std::vector<Port::StringBase>{"/proj/src/other.vhd", "/proj/src/counter.vhd"}));
  holder_->EndParse();

  auto upToDate = [&](Vad::IHdlFileIterator* files) {
    bool valid = false;
    EXPECT_EQ(holder_->IsUpToDate(&valid, files), CitI::kOk);
    return valid;
  };
  Prjrep::AutoRelease<Vad::IHdlFileIterator> same, reordered, fewer, more;
  EXPECT_TRUE(upToDate(ListOf(same, {other.Get(), file_.Get(), verilog.Get()})));
  EXPECT_FALSE(upToDate(ListOf(reordered, {file_.Get(), other.Get()})));
  EXPECT_FALSE(upToDate(ListOf(fewer, {file_.Get()})));
  auto added = NewFile(project_.Get(), "/proj/src/added.vhd", "PLUGIN_Vhdl");
  EXPECT_FALSE(upToDate(ListOf(more, {other.Get(), file_.Get(), added.Get()})));
  EXPECT_FALSE(upToDate(nullptr));
  EXPECT_EQ(holder_->IsUpToDate(nullptr, nullptr), CitI::kInvalidArg);

  SetProperty(project_.Get(), "PROP_Parse_Target", "simulation");
  EXPECT_FALSE(upToDate(same.Get()));
  SetProperty(project_.Get(), "PROP_Parse_Target", "synthesis");
  EXPECT_TRUE(upToDate(same.Get()));
  SetLibrary(file_.Get(), "lib2");
  EXPECT_FALSE(upToDate(same.Get()));

  holder_->BeginParse(nullptr);
  holder_->EndParse();
  EXPECT_TRUE(upToDate(nullptr));
}

}  // namespace
