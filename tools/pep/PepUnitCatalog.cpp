#include "pep/PepUnitCatalog.h"

#include "pep/PepTextCursor.h"

void PepUnitCatalog::AddUnit(PepDesignUnit unit) { units_.push_back(std::move(unit)); }

void PepUnitCatalog::AddReference(PepInstanceReference reference) {
  std::string folded = Folded(reference.unitKey);
  references_.emplace(std::move(folded), std::move(reference));
}

void PepUnitCatalog::Clear() {
  units_.clear();
  references_.clear();
}

const PepDesignUnit* PepUnitCatalog::FindTop(std::string_view library) const {
  const std::string wanted = Folded(library);
  for (auto unit = units_.rbegin(); unit != units_.rend(); ++unit) {
    if (unit->library == wanted && !IsInstantiatedByAnother(*unit)) return &*unit;
  }
  return nullptr;
}

const PepDesignUnit* PepUnitCatalog::FindByName(std::string_view library, std::string_view name) const {
  const std::string wanted = Folded(library);
  for (auto unit = units_.rbegin(); unit != units_.rend(); ++unit) {
    if (unit->library == wanted && SameName(unit->language, unit->key, unit->language, name)) {
      return &*unit;
    }
  }
  return nullptr;
}

bool PepUnitCatalog::IsInstantiatedByAnother(const PepDesignUnit& unit) const {
  auto [first, last] = references_.equal_range(Folded(unit.key));
  for (auto it = first; it != last; ++it) {
    const PepInstanceReference& reference = it->second;
    bool namesUnit = SameName(reference.language, reference.unitKey, unit.language, unit.key);
    bool fromItself = SameName(reference.language, reference.ownerKey, unit.language, unit.key);
    if (namesUnit && !fromItself) return true;
  }
  return false;
}

bool PepUnitCatalog::SameName(PepLanguage firstLanguage, std::string_view first, PepLanguage secondLanguage,
                              std::string_view second) {
  if (firstLanguage == PepLanguage::kVerilog && secondLanguage == PepLanguage::kVerilog)
    return first == second;
  return Folded(first) == Folded(second);
}

std::string PepUnitCatalog::Folded(std::string_view text) {
  std::string folded(text);
  for (char& c : folded) c = PepChars::Lower(c);
  return folded;
}
