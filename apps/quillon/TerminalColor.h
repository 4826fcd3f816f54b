// Colour for the severity words of messages and diagnostics on standard error.
#pragma once

#include <string>
#include <string_view>

#include "Options.h"

namespace quillon {

class TerminalColor {
 public:
  // --color always colours and never does not; auto colours when the stream `fd` is a terminal
  // and NO_COLOR is unset or empty.
  static bool Wanted(ColorMode mode, int fd);
  // `text` in the colour of `severity` ("error", "warning", anything else as info).
  static std::string Painted(std::string_view text, std::string_view severity);
};

}  // namespace quillon
