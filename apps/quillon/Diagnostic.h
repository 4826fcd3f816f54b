// A finding of quillon itself about the design (not a message of the module): where it is, how
// bad it is, and a stable code that programs and users can rely on.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace quillon {

struct Diagnostic {
  enum class Severity { kError, kWarning };

  Severity severity = Severity::kError;
  std::string code;  // one of DiagnosticCode
  std::string text;
  std::string file;               // the HDL file of the referring record; empty when no file is at fault
  std::uint32_t line = 0;         // 0 when the finding has no line
  std::string fileFullPath = {};  // set by ShownPaths, which makes `file` the path shown

  bool IsError() const { return severity == Severity::kError; }
  std::string_view SeverityText() const { return IsError() ? "error" : "warning"; }
};

namespace DiagnosticCode {
inline constexpr const char* kUnresolvedInstance = "unresolved-instance";
inline constexpr const char* kUnresolvedPackage = "unresolved-package";
inline constexpr const char* kUnknownLibrary = "unknown-library";
inline constexpr const char* kDuplicateUnit = "duplicate-unit";
inline constexpr const char* kNoValidOrder = "no-valid-order";
inline constexpr const char* kSyntaxError = "syntax-error";
inline constexpr const char* kEmptySource = "empty-source";
inline constexpr const char* kBlackBox = "black-box";
inline constexpr const char* kAmbiguousArchitecture = "ambiguous-architecture";
inline constexpr const char* kNotHdl = "not-hdl";
}  // namespace DiagnosticCode

}  // namespace quillon
