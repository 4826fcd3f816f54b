#include "Host/VhdlName.h"

namespace Host {

namespace {

unsigned char Folded(char c) { return static_cast<unsigned char>(c >= 'A' && c <= 'Z' ? c - 'A' + 'a' : c); }

}  // namespace

// Both texts are equal up to the position compared, so they are inside or outside an extended
// identifier together; a doubled backslash inside one toggles twice and changes nothing.
int CompareVhdlNames(std::string_view a, std::string_view b) {
  bool extended = false;
  const std::size_t common = a.size() < b.size() ? a.size() : b.size();
  for (std::size_t i = 0; i < common; ++i) {
    unsigned char left = extended ? static_cast<unsigned char>(a[i]) : Folded(a[i]);
    unsigned char right = extended ? static_cast<unsigned char>(b[i]) : Folded(b[i]);
    if (left != right) return left < right ? -1 : 1;
    if (a[i] == '\\') extended = !extended;
  }
  if (a.size() == b.size()) return 0;
  return a.size() < b.size() ? -1 : 1;
}

}  // namespace Host
