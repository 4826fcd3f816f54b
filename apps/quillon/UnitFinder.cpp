#include "UnitFinder.h"

#include "Host/VhdlName.h"
#include "IName.h"
#include "Port/StringBase.h"
#include "Prjrep/AutoPtr.h"
#include "Suggestions.h"

namespace quillon {

namespace {

// "Architecture|cpu|rtl" -> "cpu".
std::string_view NameInKey(std::string_view key) {
  std::size_t start = key.find('|');
  if (start == std::string_view::npos) return {};
  std::size_t end = key.find('|', start + 1);
  return key.substr(start + 1, end == std::string_view::npos ? std::string_view::npos : end - start - 1);
}

// The second look-up follows VHDL: letter case is ignored except inside extended identifiers.
bool Same(std::string_view a, std::string_view b, int compareType) {
  return compareType == Port::kCompareExact ? a == b : Host::SameVhdlName(a, b);
}

}  // namespace

UnitFinder::UnitFinder(Vad::IHdlDesignUnitSet* units) {
  Prjrep::AutoRelease<Vad::IHdlDesignUnitIterator> iterator;
  if (!units || units->CreateIterator(iterator.Out()) != CitI::kOk || !iterator) return;
  for (; !iterator->IsDone(); iterator->Next()) {
    Vad::IHdlDesignUnit* unit = iterator->Current();
    Port::StringBase key;
    if (auto* name = Prjrep::QueryAs<Prjrep::IName>(unit)) name->GetName(&key);
    if (unit) candidates_.push_back({unit, key.str()});
  }
}

Vad::IHdlDesignUnit* UnitFinder::Find(std::string_view unit) const {
  if (unit.empty()) return nullptr;
  bool isKey = unit.find('|') != std::string_view::npos;
  for (int compareType : {Port::kCompareExact, Port::kCompareNoCase}) {
    Vad::IHdlDesignUnit* found = isKey ? FindKey(unit, compareType) : FindName(unit, compareType);
    if (found) return found;
  }
  return nullptr;
}

std::string UnitFinder::DidYouMean(std::string_view unit) const {
  bool isKey = unit.find('|') != std::string_view::npos;
  std::vector<std::string> known;
  for (const Candidate& candidate : candidates_)
    known.emplace_back(isKey ? std::string_view(candidate.key) : NameInKey(candidate.key));
  return Suggestions::DidYouMean(unit, known);
}

Vad::IHdlDesignUnit* UnitFinder::FindKey(std::string_view key, int compareType) const {
  for (const Candidate& candidate : candidates_) {
    if (Same(candidate.key, key, compareType)) return candidate.unit;
  }
  return nullptr;
}

Vad::IHdlDesignUnit* UnitFinder::FindName(std::string_view name, int compareType) const {
  std::string qualified(name);
  if (auto* entity = FindKey("Entity|" + qualified, compareType)) return entity;
  if (auto* module = FindKey("Module|" + qualified, compareType)) return module;
  for (const Candidate& candidate : candidates_) {
    if (Same(NameInKey(candidate.key), name, compareType)) return candidate.unit;
  }
  return nullptr;
}

}  // namespace quillon
