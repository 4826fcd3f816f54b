#include "TerminalColor.h"

#include <unistd.h>

#include <cstdlib>

namespace quillon {

namespace {

constexpr const char* kReset = "\033[0m";

const char* ColorOf(std::string_view severity) {
  if (severity == "error") return "\033[1;31m";
  if (severity == "warning") return "\033[1;35m";
  return "\033[1;36m";
}

}  // namespace

bool TerminalColor::Wanted(ColorMode mode, int fd) {
  if (mode != ColorMode::kAuto) return mode == ColorMode::kAlways;
  const char* noColor = std::getenv("NO_COLOR");
  return !(noColor && *noColor) && isatty(fd);
}

std::string TerminalColor::Painted(std::string_view text, std::string_view severity) {
  return ColorOf(severity) + std::string(text) + kReset;
}

}  // namespace quillon
