#include "SourceFileCheck.h"

#include <string_view>

#include "PluginTable.h"

namespace quillon {

namespace {

// The categories under which the VHDL parser and the Verilog compiler issue their messages.
constexpr std::string_view kSyntaxCategories[] = {"VhdlParser", "VerilogCompiler"};
constexpr std::string_view kSyntaxErrorPrefix = "syntax error: ";

bool IsError(Port_MsgMan::MsgType type) { return type == Port_MsgMan::kError || type == Port_MsgMan::kFatal; }

// "FILE:LINE: text\n" -> "text": the diagnostic carries file and line itself.
std::string TextWithoutPlace(const Port_MsgRecord& record) {
  std::string_view text = record.text;
  while (!text.empty() && (text.back() == '\n' || text.back() == '\r')) text.remove_suffix(1);
  const std::string place = record.sourceFile + ':' + std::to_string(record.line) + ": ";
  if (!record.sourceFile.empty() && text.starts_with(place)) text.remove_prefix(place.size());
  if (text.starts_with(kSyntaxErrorPrefix)) text.remove_prefix(kSyntaxErrorPrefix.size());
  return std::string(text);
}

}  // namespace

bool SourceFileCheck::IsSyntaxError(const Port_MsgRecord& record) {
  if (!IsError(record.type) || record.sourceFile.empty()) return false;
  for (std::string_view category : kSyntaxCategories) {
    if (record.category == category) return true;
  }
  return false;
}

std::vector<Diagnostic> SourceFileCheck::SyntaxErrors(const std::vector<Port_MsgRecord>& received) {
  std::vector<Diagnostic> found;
  for (const Port_MsgRecord& record : received) {
    if (!IsSyntaxError(record)) continue;
    found.push_back({Diagnostic::Severity::kError, DiagnosticCode::kSyntaxError, TextWithoutPlace(record),
                     record.sourceFile, static_cast<std::uint32_t>(record.line > 0 ? record.line : 0)});
  }
  return found;
}

std::vector<Diagnostic> SourceFileCheck::NotHdl(const std::vector<SourceFile>& files, bool strict) {
  std::vector<Diagnostic> found;
  for (const SourceFile& file : files) {
    if (!file.pluginByExtension || file.plugin != PluginTable::kGeneralPlugin) continue;
    found.push_back({strict ? Diagnostic::Severity::kError : Diagnostic::Severity::kWarning,
                     DiagnosticCode::kNotHdl,
                     "not an HDL source: its extension names no plug-in, so only the file name is recorded "
                     "(--plugin chooses one)",
                     file.path, 0});
  }
  return found;
}

}  // namespace quillon
