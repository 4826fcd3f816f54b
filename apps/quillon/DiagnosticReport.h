// How quillon's diagnostics reach the user in text: one line each on standard error,
// "FILE:LINE: error: TEXT [code]".
#pragma once

#include <ostream>
#include <vector>

#include "Diagnostic.h"

namespace quillon {

class DiagnosticReport {
 public:
  // `color` paints the severity words.
  static void Write(const std::vector<Diagnostic>& diagnostics, std::ostream& out, bool color);
  // The same findings, every one a warning: the commands that still deliver their answer.
  static std::vector<Diagnostic> AsWarnings(std::vector<Diagnostic> diagnostics);
  static std::size_t Count(const std::vector<Diagnostic>& diagnostics, Diagnostic::Severity severity);
};

}  // namespace quillon
