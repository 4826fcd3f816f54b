#include "PluginParserFactory.h"

#include <new>
#include <string_view>

#include "AbelParser.h"
#include "AbelVectorParser.h"
#include "AssocModuleParser.h"
#include "CParserConfigHolder.h"
#include "EdifParser.h"
#include "EdifParserEx.h"
#include "EdifParserPlx.h"
#include "GenericParser.h"
#include "HrfParser.h"
#include "PlxParser.h"
#include "Port/Env.h"
#include "Port/InitObjects.h"
#include "Port/MsgManData.h"
#include "SchematicParser.h"
#include "SingleModuleParser.h"
#include "VerilogParser.h"
#include "VhdlParser.h"
#include "WaverParser.h"

namespace Vad {
namespace {

constexpr const char* kEdifSelectionVariables[] = {"CORVANE_EDIFPARSER_EX", "CORVANE_EDIFPARSER_PLX",
                                                   "CORVANE_EDIFPARSER_BASIC"};

// Host type identifiers of the six netlist-database formats.
QUILLON_XUID_FROM_TEXT(PlxDatabaseType, "{6DD669C2-9830-4a4d-B522-97C444BEB739}")
QUILLON_XUID_FROM_TEXT(TbxDatabaseType, "{98318D43-5516-4f88-880D-2695BB65C12E}")
QUILLON_XUID_FROM_TEXT(SnxDatabaseType, "{FA9F4430-626B-4c0a-8E42-DF3A21A5D9F7}")
QUILLON_XUID_FROM_TEXT(LdxDatabaseType, "{7E22DF94-54C4-424c-A139-AD63B353CE24}")
QUILLON_XUID_FROM_TEXT(MpxDatabaseType, "{41A88D74-8A10-4d7d-A4EB-FD4F8E9EC706}")
QUILLON_XUID_FROM_TEXT(RtxDatabaseType, "{3AF4FC98-5D73-4ccb-AFA0-332B1BD12D19}")

template <class P>
std::unique_ptr<Parser> Make() {
  return std::unique_ptr<Parser>(new (std::nothrow) P());
}

std::unique_ptr<Parser> MakeNetlistDatabaseParser(const Port::XUID& databaseType) {
  std::unique_ptr<Parser> parser = Make<PlxParser>();
  if (parser) parser->SetTypeId(1, databaseType);
  return parser;
}

std::unique_ptr<Parser> MakeEdifParser(const Port::StringBase& selection) {
  if (selection == "CORVANE_EDIFPARSER_PLX") return Make<EdifParserPlx>();
  if (selection == "CORVANE_EDIFPARSER_EX") return Make<EdifParserEx>();
  if (selection == "CORVANE_EDIFPARSER_BASIC") return Make<EdifParser>();
  return Make<EdifParserEx>();
}

struct PluginEntry {
  std::string_view pluginName;
  std::unique_ptr<Parser> (*make)(const Port::StringBase& edifSelection);
};

// Searched in this order; the first exact match wins.
const PluginEntry kPlugins[] = {
    {"PLUGIN_Vhdl", [](const Port::StringBase&) { return Make<VhdlParser>(); }},
    {"PLUGIN_Verilog", [](const Port::StringBase&) { return Make<VerilogParser>(); }},
    {"PLUGIN_Edif", MakeEdifParser},
    {"PLUGIN_PLX", [](const Port::StringBase&) { return MakeNetlistDatabaseParser(PlxDatabaseType()); }},
    {"PLUGIN_TBX", [](const Port::StringBase&) { return MakeNetlistDatabaseParser(TbxDatabaseType()); }},
    {"PLUGIN_SNX", [](const Port::StringBase&) { return MakeNetlistDatabaseParser(SnxDatabaseType()); }},
    {"PLUGIN_LDX", [](const Port::StringBase&) { return MakeNetlistDatabaseParser(LdxDatabaseType()); }},
    {"PLUGIN_MPX", [](const Port::StringBase&) { return MakeNetlistDatabaseParser(MpxDatabaseType()); }},
    {"PLUGIN_RTX", [](const Port::StringBase&) { return MakeNetlistDatabaseParser(RtxDatabaseType()); }},
    {"PLUGIN_Hrf", [](const Port::StringBase&) { return Make<HrfParser>(); }},
    {"PLUGIN_SingleModule", [](const Port::StringBase&) { return Make<SingleModuleParser>(); }},
    {"PLUGIN_AssocModule", [](const Port::StringBase&) { return Make<AssocModuleParser>(); }},
    {"PLUGIN_Abel", [](const Port::StringBase&) { return Make<AbelParser>(); }},
    {"PLUGIN_AbelVector", [](const Port::StringBase&) { return Make<AbelVectorParser>(); }},
    {"PLUGIN_Schematic", [](const Port::StringBase&) { return Make<SchematicParser>(); }},
    {"PLUGIN_Waver", [](const Port::StringBase&) { return Make<WaverParser>(); }},
    {"PLUGIN_Fsmdraw", [](const Port::StringBase&) { return Make<SingleModuleParser>(); }},
    {"PLUGIN_General", [](const Port::StringBase&) { return Make<GenericParser>(); }},
};

std::unique_ptr<Parser> CreateParserOfHolder(CParserConfigHolder& holder) {
  Port::StringBase edifSelection;
  GetEdifSelection(edifSelection);
  return CreateParser(edifSelection, holder);
}

}  // namespace

bool PluginParserFactory::Parse(CParserConfigHolder& holder) const {
  std::unique_ptr<Parser> parser = CreateParserOfHolder(holder);
  if (!parser) return false;
  parser->Parse(holder);
  return true;
}

void PluginParserFactory::ExtractPorts(CParserConfigHolder& holder, IHdlDesignUnit* unit,
                                       IHdlPortIterator** out) const {
  std::unique_ptr<Parser> parser = CreateParserOfHolder(holder);
  if (parser) parser->ExtractPorts(holder, unit, out);
}

std::unique_ptr<Parser> CreateParser(const Port::StringBase& edifSelection, CParserConfigHolder& holder) {
  Port::StringBase pluginName;
  holder.GetPluginName(pluginName);
  for (const PluginEntry& plugin : kPlugins) {
    if (pluginName == plugin.pluginName) return plugin.make(edifSelection);
  }
  Port_MsgManData::debugStub("WARNING: Parser %s not found. Using PLUGIN_General\n", pluginName.c_str());
  return Make<GenericParser>();
}

void GetEdifSelection(Port::StringBase& selection) {
  selection.Empty();
  for (const char* variable : kEdifSelectionVariables) {
    const char* value = Port_Env::GetEnv(variable);
    if (value && *value) {
      selection = variable;
      return;
    }
  }
}

}  // namespace Vad
