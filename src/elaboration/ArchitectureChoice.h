// Which architecture VHDL binds to an instance that names none: the one analysed last. The
// hierarchy binds it and the compile order analyses it after the entity's other architectures,
// so that the two agree.
#pragma once

#include <vector>

#include "IHdlElement.h"

namespace Vad {

class ArchitectureChoice {
 public:
  // Whether architecture `a` is analysed after architecture `b`: its file was given later (a
  // smaller order key; the first source given has the largest), equal keys by the greater path;
  // within one file the one further down.
  static bool AnalysedAfter(IHdlElement* a, IHdlElement* b);
  // The candidate analysed last; null when there is none.
  static IHdlElement* Default(const std::vector<IHdlElement*>& candidates);
};

}  // namespace Vad
