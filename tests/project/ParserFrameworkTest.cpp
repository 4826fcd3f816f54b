#include <gtest/gtest.h>

#include <typeinfo>

#include "AbelParser.h"
#include "AbelVectorParser.h"
#include "AssocModuleParser.h"
#include "EdifParser.h"
#include "EdifParserEx.h"
#include "EdifParserPlx.h"
#include "GenericParser.h"
#include "HrfParser.h"
#include "Parser.h"
#include "PluginParserFactory.h"
#include "PlxParser.h"
#include "Port/Env.h"
#include "Port/MsgManData.h"
#include "SchematicParser.h"
#include "SingleModuleParser.h"
#include "TestHost.h"
#include "VerilogParser.h"
#include "VhdlParser.h"
#include "WaverParser.h"
#include "generic.h"
#include "module.h"

using namespace test_host;

namespace {

// The EDIF selection variables, cleared for each test and put back afterwards.
struct ScopedSelectionEnvironment {
  ScopedEnv ex{"CORVANE_EDIFPARSER_EX", nullptr};
  ScopedEnv plx{"CORVANE_EDIFPARSER_PLX", nullptr};
  ScopedEnv basic{"CORVANE_EDIFPARSER_BASIC", nullptr};
};

class ParserFramework : public PipelineTest {
 protected:
  void SetUp() override {
    project_ = NewProject();
    file_ = AddNewFile(project_.Get(), "/proj/src/alu.src", "PLUGIN_General");
  }

  std::unique_ptr<Vad::Parser> ParserFor(std::string_view plugin, std::string_view selection = {}) {
    file_->setPluginName(Port::StringBase(plugin));
    return Vad::CreateParser(Port::StringBase(selection), *HolderOf(file_.Get()));
  }

  std::vector<std::string> ParseWith(std::string_view plugin) {
    file_->setPluginName(Port::StringBase(plugin));
    EXPECT_EQ(HolderOf(file_.Get())->Parse(nullptr), CitI::kOk);
    return FileUnitKeys(file_.Get());
  }

  CitI::IInterface* OnlyUnit() {
    auto units = UnitsOf(FileObject(file_.Get())->GetUnitSet());
    return units.size() == 1 ? units[0] : nullptr;
  }

  ScopedSelectionEnvironment environment_;
  Prjrep::AutoPtr<Vad::IHdlProject> project_;
  Prjrep::AutoPtr<Vad::IHdlFile> file_;
};

template <class Expected>
void ExpectParser(const std::unique_ptr<Vad::Parser>& parser, std::string_view plugin) {
  ASSERT_NE(parser, nullptr) << plugin;
  EXPECT_EQ(typeid(*parser), typeid(Expected)) << plugin;
}

TEST_F(ParserFramework, EveryPluginNameOfTheTableGetsItsParserWithoutWarning) {
  const std::pair<const char*, const std::type_info*> plugins[] = {
      {"PLUGIN_Vhdl", &typeid(Vad::VhdlParser)},
      {"PLUGIN_Verilog", &typeid(Vad::VerilogParser)},
      {"PLUGIN_Hrf", &typeid(Vad::HrfParser)},
      {"PLUGIN_SingleModule", &typeid(Vad::SingleModuleParser)},
      {"PLUGIN_AssocModule", &typeid(Vad::AssocModuleParser)},
      {"PLUGIN_Abel", &typeid(Vad::AbelParser)},
      {"PLUGIN_AbelVector", &typeid(Vad::AbelVectorParser)},
      {"PLUGIN_Schematic", &typeid(Vad::SchematicParser)},
      {"PLUGIN_Waver", &typeid(Vad::WaverParser)},
      {"PLUGIN_Fsmdraw", &typeid(Vad::SingleModuleParser)},
      {"PLUGIN_General", &typeid(Vad::GenericParser)},
  };
  Port_DebugCapture debug;
  for (const auto& [plugin, type] : plugins) {
    auto parser = ParserFor(plugin);
    ASSERT_NE(parser, nullptr) << plugin;
    EXPECT_EQ(typeid(*parser), *type) << plugin;
  }
  EXPECT_EQ(debug.text(), "");
}

TEST_F(ParserFramework, NetlistDatabasePluginsSetSlotOneToTheirFormat) {
  const std::pair<const char*, const char*> formats[] = {
      {"PLUGIN_PLX", "{6DD669C2-9830-4a4d-B522-97C444BEB739}"},
      {"PLUGIN_TBX", "{98318D43-5516-4f88-880D-2695BB65C12E}"},
      {"PLUGIN_SNX", "{FA9F4430-626B-4c0a-8E42-DF3A21A5D9F7}"},
      {"PLUGIN_LDX", "{7E22DF94-54C4-424c-A139-AD63B353CE24}"},
      {"PLUGIN_MPX", "{41A88D74-8A10-4d7d-A4EB-FD4F8E9EC706}"},
      {"PLUGIN_RTX", "{3AF4FC98-5D73-4ccb-AFA0-332B1BD12D19}"},
  };
  for (const auto& [plugin, id] : formats) {
    auto parser = ParserFor(plugin);
    ExpectParser<Vad::PlxParser>(parser, plugin);
    EXPECT_EQ(parser->GetTypeId(1), Port::XUID(std::string_view(id))) << plugin;
    EXPECT_TRUE(parser->IsTypeIdSet(1));
    EXPECT_FALSE(parser->IsTypeIdSet(0));
    EXPECT_EQ(parser->GetTypeId(0), Port::XUID());
  }
  auto parser = ParserFor("PLUGIN_PLX");
  parser->SetTypeId(7, Port::XUID(1, 2));  // outside the slots: ignored
  EXPECT_EQ(parser->GetTypeId(7), Port::XUID());
  EXPECT_FALSE(parser->IsTypeIdSet(-1));
}

TEST_F(ParserFramework, EdifSelectionComesFromTheFirstNonEmptyVariable) {
  Port::StringBase selection = "stale";
  Vad::GetEdifSelection(selection);
  EXPECT_EQ(selection, "");
  ExpectParser<Vad::EdifParserEx>(ParserFor("PLUGIN_Edif", selection.view()), "no variable");

  Port_Env::SetEnv("CORVANE_EDIFPARSER_EX", "");  // set but empty counts as unset
  Port_Env::SetEnv("CORVANE_EDIFPARSER_BASIC", "1");
  Vad::GetEdifSelection(selection);
  EXPECT_EQ(selection, "CORVANE_EDIFPARSER_BASIC");
  ExpectParser<Vad::EdifParser>(ParserFor("PLUGIN_Edif", selection.view()), "basic");

  Port_Env::SetEnv("CORVANE_EDIFPARSER_PLX", "yes");
  Vad::GetEdifSelection(selection);
  EXPECT_EQ(selection, "CORVANE_EDIFPARSER_PLX");
  ExpectParser<Vad::EdifParserPlx>(ParserFor("PLUGIN_Edif", selection.view()), "plx");

  Port_Env::SetEnv("CORVANE_EDIFPARSER_EX", "1");
  Vad::GetEdifSelection(selection);
  EXPECT_EQ(selection, "CORVANE_EDIFPARSER_EX");
  ExpectParser<Vad::EdifParserEx>(ParserFor("PLUGIN_Edif", selection.view()), "ex");
  ExpectParser<Vad::EdifParserEx>(ParserFor("PLUGIN_Edif", "something else"), "other text");
}

TEST_F(ParserFramework, PluginNameInAnotherLetterCaseWarnsAndRecordsTheFileAsAGenericUnit) {
  Port_DebugCapture debug;
  ExpectParser<Vad::GenericParser>(ParserFor("plugin_vhdl"), "plugin_vhdl");
  EXPECT_EQ(debug.text(), "WARNING: Parser plugin_vhdl not found. Using PLUGIN_General\n");

  debug.clear();
  EXPECT_EQ(ParseWith("PLUGIN_VHDL"), std::vector<std::string>{"|Generic||alu.src"});
  EXPECT_EQ(debug.text(), "WARNING: Parser PLUGIN_VHDL not found. Using PLUGIN_General\n");
  auto* unit = dynamic_cast<Vad::generic*>(Prjrep::ImplementationCast<Vad::DbObject>(OnlyUnit()));
  ASSERT_NE(unit, nullptr);
  EXPECT_EQ(unit->GetLine(), 0u);
  EXPECT_EQ(unit->GetDesignUnitTypeId(),
            Port::XUID(std::string_view("{74F4DBA5-33FB-44d9-A3A9-0802BF3CFE35}")));

  debug.clear();
  ExpectParser<Vad::GenericParser>(ParserFor(""), "empty name");
  EXPECT_EQ(debug.text(), "WARNING: Parser  not found. Using PLUGIN_General\n");
}

TEST_F(ParserFramework, FileNamedParsersRecordOneModuleAndWaverRecordsNothing) {
  const Port::XUID fileNamed{std::string_view("{3E515CB2-8A29-45dd-860D-0C91C6E19881}")};
  EXPECT_EQ(ParseWith("PLUGIN_SingleModule"), std::vector<std::string>{"|Module||alu"});
  auto* unit = dynamic_cast<Vad::module*>(Prjrep::ImplementationCast<Vad::DbObject>(OnlyUnit()));
  ASSERT_NE(unit, nullptr);
  EXPECT_TRUE(unit->GetUnitFlag());
  EXPECT_EQ(unit->GetLine(), 0u);
  EXPECT_EQ(unit->GetDesignUnitTypeId(), fileNamed);
  EXPECT_TRUE(unit->GetProperties().empty());

  EXPECT_EQ(ParseWith("PLUGIN_Fsmdraw"), std::vector<std::string>{"|Module||alu"});
  EXPECT_EQ(ParseWith("PLUGIN_AssocModule"), std::vector<std::string>{"|Module||alu.src"});
  EXPECT_TRUE(ParseWith("PLUGIN_Waver").empty());
  Vad::WaverParser waver;
  EXPECT_EQ(waver.Parse(*HolderOf(file_.Get())), 0);
  Vad::SingleModuleParser single;
  EXPECT_EQ(single.Parse(*HolderOf(file_.Get())), 1);
}

TEST_F(ParserFramework, ParsersOtherThanVhdlAndVerilogExtractNoPorts) {
  for (const char* plugin :
       {"PLUGIN_Edif", "PLUGIN_Schematic", "PLUGIN_PLX", "PLUGIN_General", "PLUGIN_Hrf"}) {
    auto parser = ParserFor(plugin);
    ASSERT_NE(parser, nullptr);
    auto* sentinel = reinterpret_cast<Vad::IHdlPortIterator*>(this);
    Vad::IHdlPortIterator* ports = sentinel;
    EXPECT_EQ(parser->ExtractPorts(*HolderOf(file_.Get()), nullptr, &ports), Vad::Parser::kNoPortExtraction)
        << plugin;
    EXPECT_EQ(ports, sentinel) << plugin;
  }
}

}  // namespace
