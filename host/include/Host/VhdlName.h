// How VHDL compares names: basic identifiers without regard to letter case, extended identifiers
// (\Like This\) exactly, backslashes included.
#pragma once

#include <string_view>

namespace Host {

// <0, 0 or >0 like strcmp. ASCII letters outside backslash-delimited parts are folded to lower
// case; the texts may hold several names (keys such as "Architecture|\Top\|rtl").
int CompareVhdlNames(std::string_view a, std::string_view b);

inline bool SameVhdlName(std::string_view a, std::string_view b) { return CompareVhdlNames(a, b) == 0; }

// An ordering for maps keyed by VHDL names.
struct VhdlNameLess {
  bool operator()(std::string_view a, std::string_view b) const { return CompareVhdlNames(a, b) < 0; }
};

}  // namespace Host
