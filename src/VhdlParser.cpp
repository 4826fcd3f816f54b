#include "VhdlParser.h"

#include <cstdio>

#include "CParserConfigHolder.h"
#include "Port/StringBase.h"
#include "jpParser.h"

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

bool IsSynthesisTarget(const CParserConfigHolder& holder) {
  Port::StringBase target;
  holder.GetProperty(VhdlParser::kParseTargetProperty, target);
  return target == VhdlParser::kSynthesisTarget;
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
  return 0;
}

}  // namespace Vad
