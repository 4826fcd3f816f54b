#include "ArchitectureChoice.h"

#include <cstdint>

#include "CHdlElement.h"
#include "IHdlFile.h"
#include "Port/StringBase.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/Casts.h"

namespace Vad {

namespace {

struct AnalysisPlace {
  std::uint64_t orderKey = 0;
  Port::StringBase path;
  std::uint32_t line = 0;
};

AnalysisPlace PlaceOf(IHdlElement* element) {
  AnalysisPlace place;
  Prjrep::AutoPtr<IHdlFile> file;
  if (element && element->GetSourceFile(file.Out()) == CitI::kOk && file) {
    file->getOrderKey(&place.orderKey);
    Port::StringBase directory;
    Port::StringBase name;
    file->getFileName(&directory, &name);
    place.path = directory;
    place.path.Append(name.view());
  }
  if (auto* record = Prjrep::ImplementationCast<CHdlElement>(element)) place.line = record->GetLine();
  return place;
}

}  // namespace

bool ArchitectureChoice::AnalysedAfter(IHdlElement* a, IHdlElement* b) {
  AnalysisPlace first = PlaceOf(a);
  AnalysisPlace second = PlaceOf(b);
  if (first.orderKey != second.orderKey) return first.orderKey < second.orderKey;
  if (int order = first.path.Compare(second.path.view()); order != 0) return order > 0;
  return first.line > second.line;
}

IHdlElement* ArchitectureChoice::Default(const std::vector<IHdlElement*>& candidates) {
  IHdlElement* chosen = nullptr;
  for (IHdlElement* candidate : candidates) {
    if (!chosen || AnalysedAfter(candidate, chosen)) chosen = candidate;
  }
  return chosen;
}

}  // namespace Vad
