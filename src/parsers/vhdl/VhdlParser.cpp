#include "VhdlParser.h"

#include <cstdio>

#include "CHdlFile.h"
#include "CParserConfigHolder.h"
#include "HdlSets.h"
#include "IHdlElaborationData.h"
#include "IHdlProject.h"
#include "Port/MsgManData.h"
#include "Port/StringBase.h"
#include "PortExtraction.h"
#include "Prjrep/AutoPtr.h"
#include "jpParser.h"
#include "pep/PepExtractor.h"

namespace Vad {
namespace {

void ReportFileNotFound(const Port::StringBase& path, const std::string& reason) {
  if (reason.empty()) {
    std::printf(VhdlParser::kFileNotFound, path.c_str());
  } else {
    std::printf(VhdlParser::kFileNotFoundBecause, path.c_str(), reason.c_str());
  }
  std::fflush(stdout);
}

void ReportSyntaxError(const Port::StringBase& path, const VhdlStructure::Fault& fault) {
  Port_MsgManData::createObject(VhdlParser::kMessageCategory, path.c_str(), static_cast<int>(fault.line), "")
      ->issueError(VhdlParser::kSyntaxError, path.c_str(), fault.line, fault.text.c_str());
}

bool IsSynthesisTarget(const CParserConfigHolder& holder) {
  Port::StringBase target;
  holder.GetProperty(VhdlParser::kParseTargetProperty, target);
  return target == VhdlParser::kSynthesisTarget;
}

// The extractor's language for a file of the compile order; false for files it does not read.
bool ExtractorLanguageOf(IHdlFile* file, int& language) {
  Port::StringBase plugin;
  if (!file || file->getPluginName(&plugin) != CitI::kOk) return false;
  if (plugin == "PLUGIN_Vhdl") {
    language = PepExtractor::kVhdl;
  } else if (plugin == "PLUGIN_Verilog") {
    language = PepExtractor::kVerilog;
  } else {
    return false;
  }
  return true;
}

bool ListCompileOrder(CParserConfigHolder& holder, IHdlDesignUnit* unit,
                      std::vector<PortExtraction::DesignFile>& files) {
  Prjrep::AutoRelease<IHdlProject> project;
  if (!holder.GetFile() || holder.GetFile()->getProject(project.Out()) != CitI::kOk) return false;
  auto* elaboration = Prjrep::QueryAs<IHdlElaborationData>(project.Get());
  Prjrep::AutoRelease<IHdlFileIterator> order;
  if (!elaboration || elaboration->getCompileOrderByDU(unit, true, order.Out()) != CitI::kOk || !order)
    return false;
  for (order->First(); !order->IsDone(); order->Next()) {
    PortExtraction::DesignFile file;
    if (ExtractorLanguageOf(order->Current(), file.language) &&
        PortExtraction::ExtractorPathOf(order->Current(), file.path))
      files.push_back(std::move(file));
  }
  return true;
}

}  // namespace

int VhdlParser::Parse(CParserConfigHolder& holder) {
  Port::StringBase path;
  holder.GetFullPath(path);
  jpParser driver(path);
  if (!driver.IsOpen()) {
    ReportFileNotFound(path, driver.OpenFailureReason());
    return 0;
  }
  // Running out of memory ends this file's parse early; what was recorded stays, as it does
  // after any other stop.
  driver.Run(holder, IsSynthesisTarget(holder));
  if (driver.SyntaxError()) ReportSyntaxError(path, *driver.SyntaxError());
  return 0;
}

CitI::Result VhdlParser::ExtractPorts(CParserConfigHolder& holder, IHdlDesignUnit* unit,
                                      IHdlPortIterator** ports) {
  return PortExtraction::Extract(
      unit,
      [&](std::vector<PortExtraction::DesignFile>& files) { return ListCompileOrder(holder, unit, files); },
      ports);
}

}  // namespace Vad
