#include <gtest/gtest.h>

#include "CHdlProject.h"
#include "CLibRefs.h"
#include "Port/MsgManData.h"
#include "Prjrep/RefCounting.h"
#include "TestHost.h"
#include "module.h"

using namespace test_host;

namespace {

class HdlProject : public PipelineTest {
 protected:
  void SetUp() override { project_ = NewProject(); }

  Vad::IHdlFileSet* Files() { return FileSetOf(project_.Get()); }

  std::vector<std::string> AllUnitKeys(CitI::Result* result = nullptr) {
    Prjrep::AutoRelease<Vad::IHdlDesignUnitSet> units;
    CitI::Result status = project_->getAllDesignUnits(units.Out());
    if (result) *result = status;
    EXPECT_EQ(status, CitI::kOk);
    return StoreKeys(units.Get());
  }

  std::vector<std::string> PathsInTable() {
    std::vector<std::string> paths;
    Prjrep::AutoRelease<Vad::IHdlFileIterator> it;
    EXPECT_EQ(Files()->CreateIterator(it.Out()), CitI::kOk);
    for (; !it->IsDone(); it->Next()) {
      Port::StringBase path;
      Prjrep::QueryAs<Prjrep::IFileNameHelper>(it->Current())->GetFullPath(&path);
      paths.push_back(path.str());
    }
    return paths;
  }

  static Prjrep::AutoPtr<CitI::IInterface> OnlyUnit(Vad::IHdlFile* file) {
    auto units = UnitsOf(FileObject(file)->GetUnitSet());
    return Prjrep::AutoPtr<CitI::IInterface>(units.size() == 1 ? units[0] : nullptr);
  }

  static void MakeVerilog(Vad::IHdlFile* file, std::uint64_t orderKey) {
    Prjrep::QueryAs<Vad::IHdlFileV3>(file)->setV3Flag(true);
    file->setOrderKey(orderKey);
  }

  Prjrep::AutoPtr<Vad::IHdlProject> project_;
};

TEST_F(HdlProject, KeepsOneConfigurationAndMakesLooseOnesOnRequest) {
  Prjrep::AutoPtr<Vad::IHdlParserConfig> own, again, loose;
  ASSERT_EQ(project_->getParserConfig(own.Out()), CitI::kOk);
  ASSERT_EQ(project_->getParserConfig(again.Out()), CitI::kOk);
  EXPECT_EQ(own.Get(), again.Get());
  EXPECT_EQ(Prjrep::RefCountOf(own.Get()), 3u);
  ASSERT_EQ(project_->getNewParserConfig(loose.Out()), CitI::kOk);
  EXPECT_NE(loose.Get(), own.Get());
  EXPECT_EQ(Prjrep::RefCountOf(loose.Get()), 1u);
  EXPECT_EQ(project_->getNewParserConfig(nullptr), CitI::kInvalidArg);

  auto* object = Prjrep::ObjectCast<Vad::CHdlProject>(project_.Get());
  Vad::CLibRefs* references = object->getLibraryReferences();
  ASSERT_NE(references, nullptr);
  EXPECT_EQ(object->getLibraryReferences(), references);
  EXPECT_EQ(Prjrep::ImplementationCast<Vad::CLibRefs>(references), references);
  // The references follow the configuration's device family, the default one while it has none.
  EXPECT_EQ(references->Family(), "kestrel");
  SetProperty(project_.Get(), "PROP_DevFamilyPMName", "lumen");
  EXPECT_EQ(object->getLibraryReferences()->Family(), "lumen");
}

TEST_F(HdlProject, FilesAreKeyedByFullPathAndASecondObjectReplacesTheFirst) {
  auto first = AddNewFile(project_.Get(), "/proj/b/top.v", "PLUGIN_Verilog");
  auto other = AddNewFile(project_.Get(), "/proj/a/sub.v", "PLUGIN_Verilog");
  EXPECT_EQ(Prjrep::RefCountOf(first.Get()), 2u);
  auto second = NewFile(project_.Get(), "/proj/b/top.v", "PLUGIN_Verilog");
  ASSERT_EQ(Files()->Add(second.Get()), CitI::kOk);
  EXPECT_EQ(Files()->GetCount(), 2u);
  EXPECT_EQ(Prjrep::RefCountOf(first.Get()), 1u);
  EXPECT_EQ(Prjrep::RefCountOf(second.Get()), 2u);
  EXPECT_EQ(PathsInTable(), (std::vector<std::string>{"/proj/a/sub.v", "/proj/b/top.v"}));
  // The replaced file no longer counts as part of the project.
  Prjrep::AutoPtr<Vad::IHdlProject> owner;
  first->getProject(owner.Out());
  EXPECT_FALSE(owner);
  second->getProject(owner.Out());
  EXPECT_EQ(owner.Get(), project_.Get());

  EXPECT_EQ(Files()->Add(nullptr), CitI::kOk);
  EXPECT_EQ(Files()->Add(second.Get()), CitI::kOk);  // again under its own key: nothing changes
  EXPECT_EQ(Files()->GetCount(), 2u);
  EXPECT_EQ(Prjrep::RefCountOf(second.Get()), 2u);
}

TEST_F(HdlProject, RemoveErasesWhereTheIteratorStandsAndMovesItOn) {
  auto a = AddNewFile(project_.Get(), "/p/a.v", "PLUGIN_Verilog");
  auto b = AddNewFile(project_.Get(), "/p/b.v", "PLUGIN_Verilog");
  auto c = AddNewFile(project_.Get(), "/p/c.v", "PLUGIN_Verilog");
  Prjrep::AutoRelease<Vad::IHdlFileIterator> it;
  ASSERT_EQ(Files()->CreateIterator(it.Out()), CitI::kOk);
  ASSERT_EQ(it->Next(), CitI::kOk);
  EXPECT_EQ(Files()->Remove(it.Get()), CitI::kOk);
  EXPECT_EQ(it->Current(), c.Get());
  EXPECT_EQ(PathsInTable(), (std::vector<std::string>{"/p/a.v", "/p/c.v"}));
  EXPECT_EQ(Prjrep::RefCountOf(b.Get()), 1u);

  it->Next();
  ASSERT_TRUE(it->IsDone());
  EXPECT_EQ(Files()->Remove(it.Get()), CitI::kOk);  // past the end: nothing happens
  EXPECT_EQ(Files()->Remove(nullptr), CitI::kOk);
  EXPECT_EQ(Files()->GetCount(), 2u);

  EXPECT_EQ(Files()->Clear(), CitI::kOk);
  EXPECT_EQ(Files()->GetCount(), 0u);
  EXPECT_EQ(Prjrep::RefCountOf(a.Get()), 1u);
}

TEST_F(HdlProject, AnIteratorKeepsTheProjectAlive) {
  AddNewFile(project_.Get(), "/p/a.v", "PLUGIN_Verilog");
  Prjrep::AutoRelease<Vad::IHdlFileIterator> it;
  ASSERT_EQ(Files()->CreateIterator(it.Out()), CitI::kOk);
  project_ = nullptr;
  ASSERT_FALSE(it->IsDone());
  EXPECT_NE(it->Current(), nullptr);
}

// The road of the host: project, createNewFile, InitializeAfterCreate, path, plug-in name, order
// key, V3 flag, source library, Add, getAllDesignUnits; all through the registry.
TEST_F(HdlProject, CollectsTheDesignUnitsOfEveryFileAsAHostSeesThem) {
  struct Source {
    const char* path;
    const char* plugin;
    const char* library;
  };
  const Source sources[] = {
      {"/proj/rtl/alu.blk", "PLUGIN_SingleModule", "work"}, {"/proj/rtl/fsm.dia", "PLUGIN_Fsmdraw", "ctrl"},
      {"/proj/doc/readme.txt", "PLUGIN_General", nullptr},  {"/proj/sim/wave.wdb", "PLUGIN_Waver", "work"},
      {"/proj/rtl/cpu.v", "PLUGIN_Verilog", "work"},
  };
  std::uint64_t orderKey = 100;
  for (const Source& source : sources) {
    auto file = NewFile(project_.Get(), source.path, source.plugin);
    file->setOrderKey(orderKey--);
    Prjrep::QueryAs<Vad::IHdlFileV3>(file.Get())->setV3Flag(true);
    if (source.library) SetLibrary(file.Get(), source.library);
    ASSERT_EQ(Files()->Add(file.Get()), CitI::kOk);
  }

  // In file-key order; the waveform file holds nothing.
  EXPECT_EQ(AllUnitKeys(),
            (std::vector<std::string>{"|Generic||readme.txt", "|Module||alu", "|Module||fsm"}));
  Prjrep::AutoRelease<Vad::IHdlDesignUnitSet> units;
  ASSERT_EQ(project_->getAllDesignUnits(units.Out()), CitI::kOk);
  EXPECT_EQ(Prjrep::RefCountOf(units.Get()), 1u);
  for (CitI::IInterface* unit : UnitsOf(units.Get())) {
    auto* element = Prjrep::ImplementationCast<Vad::CHdlElement>(unit);
    ASSERT_NE(element, nullptr);
    Port::StringBase library;
    ASSERT_EQ(element->GetLibraryName(&library), CitI::kOk);
    EXPECT_EQ(library, element->GetName() == "fsm" ? "ctrl" : "work") << element->GetName().str();
  }
}

TEST_F(HdlProject, OnlyTheSixDesignUnitKindsAreCollected) {
  auto file = AddNewFile(project_.Get(), "/proj/ctx.vhd", "PLUGIN_Vhdl");
  Vad::CParserConfigHolder* holder = HolderOf(file.Get());
  const Port::XUID type{std::string_view("{5F603C6A-2358-4949-99FB-D99B7306D2B5}")};
  holder->BeginParse(nullptr);
  holder->AddLibrary("ieee", 1, type);
  holder->AddUse("ieee.std_logic_1164.all", 2, type, false);
  holder->EndParse();
  file->setNeedsParse(false);  // the parse above stands for the file's own

  CitI::Result result = CitI::kFail;
  EXPECT_TRUE(AllUnitKeys(&result).empty());
  EXPECT_EQ(result, CitI::kOk);
  EXPECT_EQ(FileUnitKeys(file.Get()).size(), 2u);  // still there, just not design units
}

TEST_F(HdlProject, VerilogFilesAreListedToEveryParseByOrderKeyLargestFirst) {
  auto low = AddNewFile(project_.Get(), "/p/a_low.v", "PLUGIN_Verilog");
  auto high = AddNewFile(project_.Get(), "/p/b_high.v", "PLUGIN_VERILOG");
  auto tie = AddNewFile(project_.Get(), "/p/c_tie.v", "plugin_verilog");
  auto notV3 = AddNewFile(project_.Get(), "/p/d_old.v", "PLUGIN_Verilog");
  auto vhdl = AddNewFile(project_.Get(), "/p/e.vhd", "PLUGIN_Vhdl");
  MakeVerilog(low.Get(), 5);
  MakeVerilog(high.Get(), 9);
  MakeVerilog(tie.Get(), 5);
  notV3->setOrderKey(100);
  MakeVerilog(vhdl.Get(), 50);

  AllUnitKeys();
  const std::vector<Port::StringBase> expected{"/p/b_high.v", "/p/a_low.v", "/p/c_tie.v"};
  EXPECT_EQ(HolderOf(low.Get())->GetSiblingPaths().Paths(), expected);
  EXPECT_EQ(HolderOf(high.Get())->GetSiblingPaths().Paths(), expected);
  EXPECT_TRUE(HolderOf(vhdl.Get())->GetSiblingPaths().Paths().empty());
  // A Verilog file outside the survey finds its siblings in the list all the same.
  EXPECT_EQ(HolderOf(notV3.Get())->GetSiblingPaths().Paths(), expected);
  // One list for all the files of a pass, not a copy per file.
  EXPECT_EQ(&HolderOf(low.Get())->GetSiblingPaths(), &HolderOf(high.Get())->GetSiblingPaths());

  // Reordering the Verilog files makes them out of date.
  high->setOrderKey(1);
  Prjrep::AutoPtr<CitI::IInterface> before = OnlyUnit(high.Get());  // generic: name in another case
  ASSERT_TRUE(before);
  AllUnitKeys();
  EXPECT_EQ(HolderOf(low.Get())->GetSiblingPaths().Paths(),
            (std::vector<Port::StringBase>{"/p/a_low.v", "/p/c_tie.v", "/p/b_high.v"}));
  EXPECT_NE(OnlyUnit(high.Get()).Get(), before.Get());
}

TEST_F(HdlProject, OneChangedVerilogFileMarksEveryVerilogFileOfAnyCase) {
  auto changed = AddNewFile(project_.Get(), "/p/a.v", "PLUGIN_Verilog");
  auto upper = AddNewFile(project_.Get(), "/p/b.v", "PLUGIN_VERILOG");
  auto outside = AddNewFile(project_.Get(), "/p/c.v", "plugin_verilog");
  auto general = AddNewFile(project_.Get(), "/p/d.txt", "PLUGIN_General");
  MakeVerilog(changed.Get(), 2);
  MakeVerilog(upper.Get(), 1);
  AllUnitKeys();
  auto upperUnit = OnlyUnit(upper.Get());
  auto outsideUnit = OnlyUnit(outside.Get());
  auto generalUnit = OnlyUnit(general.Get());
  ASSERT_TRUE(upperUnit && outsideUnit && generalUnit);

  AllUnitKeys();  // nothing changed: nothing parsed
  EXPECT_EQ(OnlyUnit(upper.Get()).Get(), upperUnit.Get());
  EXPECT_EQ(OnlyUnit(outside.Get()).Get(), outsideUnit.Get());

  changed->setNeedsParse(true);
  AllUnitKeys();
  EXPECT_NE(OnlyUnit(upper.Get()).Get(), upperUnit.Get());
  EXPECT_NE(OnlyUnit(outside.Get()).Get(), outsideUnit.Get());
  EXPECT_EQ(OnlyUnit(general.Get()).Get(), generalUnit.Get());
  for (auto* file : {changed.Get(), upper.Get(), outside.Get()}) {
    bool needsParse = true;
    file->getNeedsParse(&needsParse);
    EXPECT_FALSE(needsParse);
  }
}

TEST_F(HdlProject, ConfigurationAndLibraryChangesBringFilesUpToDateAgain) {
  auto file = AddNewFile(project_.Get(), "/p/notes.txt", "PLUGIN_General");
  SetProperty(project_.Get(), "PROP_DevFamilyPMName", "kestrel");
  AllUnitKeys();
  auto first = OnlyUnit(file.Get());
  AllUnitKeys();
  EXPECT_EQ(OnlyUnit(file.Get()).Get(), first.Get());

  SetProperty(project_.Get(), "PROP_DevFamilyPMName", "falcon");
  AllUnitKeys();
  auto second = OnlyUnit(file.Get());
  EXPECT_NE(second.Get(), first.Get());

  SetLibrary(file.Get(), "other");
  AllUnitKeys();
  EXPECT_NE(OnlyUnit(file.Get()).Get(), second.Get());
}

TEST_F(HdlProject, UndefinedInstancesAreReportedAsNotDefined) {
  test_host::CollectedMessages messages;
  EXPECT_EQ(Prjrep::QueryAs<Vad::IHdlElaborationData>(project_.Get())->getUndefinedInstances(), CitI::kFail);
  ASSERT_EQ(messages.records().size(), 1u);
  const Port_MsgRecord& message = messages.records()[0];
  EXPECT_EQ(message.type, Port_MsgMan::kError);
  EXPECT_EQ(message.text,
            "Not Defined:  Vad::CHdlVie::CHdlView_IHdlElaborationData::getUndefinedInstances\n");
  EXPECT_EQ(message.category, "ProjectMgmt");
  EXPECT_EQ(message.sourceFile, "../src/CHdlProject");
}

TEST_F(HdlProject, PortsAreAskedOnlyOfThisModulesUnits) {
  auto file = AddNewFile(project_.Get(), "/p/notes.txt", "PLUGIN_General");
  auto* elaboration = Prjrep::QueryAs<Vad::IHdlElaborationData>(project_.Get());
  AllUnitKeys();
  auto unit = OnlyUnit(file.Get());
  auto* designUnit = Prjrep::QueryAs<Vad::IHdlDesignUnit>(unit.Get());
  ASSERT_NE(designUnit, nullptr);
  Vad::IHdlPortIterator* ports = nullptr;
  EXPECT_EQ(elaboration->getDesignUnitPorts(designUnit, nullptr), CitI::kInvalidArg);
  EXPECT_EQ(elaboration->getDesignUnitPorts(nullptr, &ports), CitI::kInvalidArg);
  EXPECT_EQ(elaboration->getDesignUnitPorts(designUnit, &ports), CitI::kOk);
  EXPECT_EQ(ports, nullptr);  // the generic parser extracts no ports
}

TEST_F(HdlProject, OperationsRefuseMissingArgumentsAndFixedSlotsAnswerAsBefore) {
  auto* elaboration = Prjrep::QueryAs<Vad::IHdlElaborationData>(project_.Get());
  EXPECT_EQ(elaboration->getHierarchyRoot(nullptr), CitI::kInvalidArg);
  EXPECT_EQ(elaboration->getCompileOrder(nullptr, nullptr), CitI::kInvalidArg);
  Vad::IHdlFileIterator* order = nullptr;
  EXPECT_EQ(elaboration->getCompileOrderByDU(nullptr, true, &order), CitI::kFail);
  EXPECT_EQ(Prjrep::ObjectCast<Vad::CHdlProject>(project_.Get())->getElaborator(nullptr), CitI::kInvalidArg);
  EXPECT_EQ(project_->createNewFile(nullptr), CitI::kInvalidArg);
  EXPECT_EQ(project_->getAllDesignUnits(nullptr), CitI::kInvalidArg);
  EXPECT_EQ(project_->getParserConfig(nullptr), CitI::kInvalidArg);
  EXPECT_EQ(project_->Reserved2(), CitI::kOk);
  EXPECT_EQ(project_->Reserved3(), CitI::kOk);
  Prjrep::AutoPtr<CitI::IInterface> none;
  EXPECT_EQ(project_->Reserved7(none.Out()), CitI::kNotImpl);
  EXPECT_FALSE(none);
}

// Two VHDL sources of our own, read through the whole road from the host's calls to the records.
TEST_F(HdlProject, ReadsVhdlSourcesIntoTheirDesignUnits) {
  const std::string data = QUILLON_TEST_DATA_DIR "/pipeline/";
  auto package = NewFile(project_.Get(), data + "counter_pkg.vhd", "PLUGIN_Vhdl");
  auto counter = NewFile(project_.Get(), data + "counter.vhd", "PLUGIN_Vhdl");
  SetLibrary(package.Get(), "work");
  ASSERT_EQ(Files()->Add(package.Get()), CitI::kOk);
  ASSERT_EQ(Files()->Add(counter.Get()), CitI::kOk);

  EXPECT_EQ(AllUnitKeys(),
            (std::vector<std::string>{"|Architecture||rtl|counter||", "|Entity||counter",
                                      "|PackageBody||counter_pkg|", "|PackageDecl||counter_pkg|"}));
  EXPECT_EQ(FileUnitKeys(counter.Get()), (std::vector<std::string>{
                                             "|Architecture||rtl|counter||",
                                             "|ComponentInstantiation||counter|rtl|u_add|adder|",
                                             "|ComponentInstantiation||counter|rtl|u_bit|adder|",
                                             "|Entity||counter",
                                             "||Library|ieee|",
                                             "||Use|ieee|std_logic_1164|all|",
                                             "||Use|work|counter_pkg|all|",
                                         }));
  for (CitI::IInterface* unit : UnitsOf(FileObject(counter.Get())->GetUnitSet())) {
    auto* element = Prjrep::ImplementationCast<Vad::CHdlElement>(unit);
    if (element->GetType() != Vad::DbType::kComponentInstantiation) continue;
    EXPECT_EQ(element->IsInGenerate(), element->GetName() == "u_bit") << element->GetName().str();
  }
}

}  // namespace
