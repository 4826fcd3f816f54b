#include "Progress.h"

#include <unistd.h>

#include <cstdio>

namespace quillon {

Progress::Progress(bool quiet, std::size_t fileCount)
    : enabled_(!quiet && fileCount >= kLargeProject && isatty(terminal_)) {}

void Progress::Step(std::string_view what, std::size_t done, std::size_t total) {
  if (!enabled_) return;
  ::dprintf(terminal_, "\r\033[Kquillon: %.*s %zu/%zu", static_cast<int>(what.size()), what.data(), done,
            total);
  lineShown_ = true;
}

void Progress::Phase(std::string_view what) {
  if (!enabled_) return;
  ::dprintf(terminal_, "\r\033[Kquillon: %.*s", static_cast<int>(what.size()), what.data());
  lineShown_ = true;
}

void Progress::Clear() {
  if (!lineShown_) return;
  ::dprintf(terminal_, "\r\033[K");
  lineShown_ = false;
}

}  // namespace quillon
