#include "DiagnosticReport.h"

#include <algorithm>

#include "TerminalColor.h"

namespace quillon {

void DiagnosticReport::Write(const std::vector<Diagnostic>& diagnostics, std::ostream& out, bool color) {
  for (const Diagnostic& diagnostic : diagnostics) {
    if (!diagnostic.file.empty()) {
      out << diagnostic.file;
      if (diagnostic.line != 0) out << ':' << diagnostic.line;
      out << ": ";
    }
    std::string_view severity = diagnostic.SeverityText();
    out << (color ? TerminalColor::Painted(severity, severity) : std::string(severity)) << ": "
        << diagnostic.text << " [" << diagnostic.code << "]\n";
  }
}

std::vector<Diagnostic> DiagnosticReport::AsWarnings(std::vector<Diagnostic> diagnostics) {
  for (Diagnostic& diagnostic : diagnostics) diagnostic.severity = Diagnostic::Severity::kWarning;
  return diagnostics;
}

std::size_t DiagnosticReport::Count(const std::vector<Diagnostic>& diagnostics,
                                    Diagnostic::Severity severity) {
  return static_cast<std::size_t>(std::count_if(diagnostics.begin(), diagnostics.end(),
                                                [&](const Diagnostic& d) { return d.severity == severity; }));
}

}  // namespace quillon
