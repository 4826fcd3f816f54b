// Finds the design unit that a UNIT argument names: a design-unit key (Entity|cpu,
// Architecture|cpu|rtl, Module|top) or a plain name, which matches an entity, then a module, then
// any unit of that name.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "HdlSets.h"
#include "IHdlDesignUnit.h"

namespace quillon {

class UnitFinder {
 public:
  // `units` must outlive the finder.
  explicit UnitFinder(Vad::IHdlDesignUnitSet* units);

  // Null when nothing matches. An exact match wins over one that ignores letter case. The answer
  // carries no reference: the set keeps it alive.
  Vad::IHdlDesignUnit* Find(std::string_view unit) const;
  // "; did you mean ...?" with the closest keys (for a key) or names (for a name), or "".
  std::string DidYouMean(std::string_view unit) const;

 private:
  struct Candidate {
    Vad::IHdlDesignUnit* unit;
    std::string key;
  };

  Vad::IHdlDesignUnit* FindKey(std::string_view key, int compareType) const;
  Vad::IHdlDesignUnit* FindName(std::string_view name, int compareType) const;

  std::vector<Candidate> candidates_;
};

}  // namespace quillon
