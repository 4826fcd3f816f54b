// The manual page of quillon in roff, made from the tables of commands and options so that it
// cannot drift from the help.
#pragma once

#include <ostream>

namespace quillon {

class ManPage {
 public:
  static void Write(std::ostream& out);
};

}  // namespace quillon
