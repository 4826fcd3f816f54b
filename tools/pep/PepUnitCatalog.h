// The design units and instance references read from all parsed files, in file order, and the
// two ways of looking a unit up.
#pragma once

#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "pep/PepDesignUnit.h"

class PepUnitCatalog {
 public:
  void AddUnit(PepDesignUnit unit);
  void AddReference(PepInstanceReference reference);
  void Clear();

  // Among the units of `library` that no other unit instantiates, the last one read; null when
  // there is none (also when every unit is instantiated, as in a cycle).
  const PepDesignUnit* FindTop(std::string_view library) const;
  // The last unit of `library` named `name` (VHDL units: in any letter case); null when none is.
  const PepDesignUnit* FindByName(std::string_view library, std::string_view name) const;

  // Names compare without letter case when either side is VHDL.
  static bool SameName(PepLanguage firstLanguage, std::string_view first, PepLanguage secondLanguage,
                       std::string_view second);
  static std::string Folded(std::string_view text);

 private:
  bool IsInstantiatedByAnother(const PepDesignUnit& unit) const;

  std::vector<PepDesignUnit> units_;
  // References by the folded name of the unit they instantiate.
  std::unordered_multimap<std::string, PepInstanceReference> references_;
};
