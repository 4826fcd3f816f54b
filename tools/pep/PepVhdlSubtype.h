// Reads a VHDL subtype indication as written in a port or generic declaration: the type mark
// and its first index range or range constraint.
//   std_logic_vector(7 downto 0)     -> "std_logic_vector", 7 .. 0
//   integer range 0 to 15            -> "integer", 0 .. 15
//   resolved std_logic               -> "std_logic", no range
//   t_words(x'range)                 -> "t_words", a range that will not evaluate
#pragma once

#include <optional>
#include <string>

#include "pep/PepDesignUnit.h"

struct PepVhdlSubtype {
  std::string typeMark;             // as written, dots included
  std::string typeMarkKey;          // lower case
  bool hasRangeConstraint = false;  // "range L to R": the type is an integer one
  std::optional<PepRangeExpression> range;

  static PepVhdlSubtype Read(const PepTokens& indication);
  // integer, natural, positive, or any type constrained by "range".
  bool IsIntegerType() const;
};
