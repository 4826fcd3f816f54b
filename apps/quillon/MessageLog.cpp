#include "MessageLog.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <cwchar>
#include <cwctype>
#include <string>

#include "Port/MsgDispatcher.h"
#include "SourceFileCheck.h"
#include "TerminalColor.h"

namespace quillon {

namespace {

constexpr const char* kSourceName = "quillon";

const char* SeverityOf(Port_MsgMan::MsgType type) {
  switch (type) {
    case Port_MsgMan::kWarning:
      return "warning";
    case Port_MsgMan::kError:
    case Port_MsgMan::kInternal:
    case Port_MsgMan::kFatal:
    case Port_MsgMan::kUserFatal:
      return "error";
    default:
      return "info";
  }
}

std::string WithoutTrailingLineEnds(std::string text) {
  while (!text.empty() && (text.back() == '\n' || text.back() == '\r')) text.pop_back();
  return text;
}

// QUILLON_DEBUG already sends the developer texts to standard error; a sink would repeat them.
bool DebugVariableSet() {
  const char* value = std::getenv("QUILLON_DEBUG");
  return value && *value && std::string_view(value) != "0";
}

void WriteDeveloperText(std::string_view text) { std::fwrite(text.data(), 1, text.size(), stderr); }

}  // namespace

MessageLog::MessageLog(bool quiet, bool verbose, bool color)
    : Port_MsgManDefault("quillon"), quiet_(quiet), color_(color) {
  Port_MsgMan* standard = Port_MsgDispatcher::getDefaultMsgMan();
  defaultWasRegistered_ = Port_MsgDispatcher::removeMsgMan(standard);
  Port_MsgDispatcher::addMsgMan(this);
  if (verbose && !DebugVariableSet()) {
    previousSink_ = Port_MsgManData::setDebugSink(WriteDeveloperText);
    sinkInstalled_ = true;
  }
}

MessageLog::~MessageLog() {
  if (sinkInstalled_) Port_MsgManData::setDebugSink(previousSink_);
  Port_MsgDispatcher::removeMsgMan(this);
  if (defaultWasRegistered_) Port_MsgDispatcher::addMsgMan(Port_MsgDispatcher::getDefaultMsgMan());
}

void MessageLog::ReportError(std::string_view text) {
  Port_MsgManData(nullptr, kSourceName, 0, nullptr)
      .issueError("%.*s", static_cast<int>(text.size()), text.data());
}

void MessageLog::ReportWarning(std::string_view text) {
  Port_MsgManData(nullptr, kSourceName, 0, nullptr)
      .issueWarning("%.*s", static_cast<int>(text.size()), text.data());
}

bool MessageLog::HasErrors() const {
  return getErrCount() + getIntCount() + getFatalCount() + getUserFatalCount() > 0;
}

void MessageLog::deliverMsg(const Port_MsgRecord& record) {
  received_.push_back(record);
  if (divertSyntaxErrors_ && SourceFileCheck::IsSyntaxError(record)) return;
  std::vector<Port_MsgRecord> ready;
  cycles_.Take(record, ready);
  for (const Port_MsgRecord& each : ready) Port_MsgManDefault::deliverMsg(each);
}

void MessageLog::onMessage(const Port_MsgRecord& record) {
  messages_.push_back(
      {SeverityOf(record.type), WithoutTrailingLineEnds(record.text), record.sourceFile, record.line});
}

// Repeated cycle listings never get here (CycleListings drops them); blank messages are not printed.
void MessageLog::writeMsgLines(MsgType type, const wchar_t* const* lines, int count) {
  if (quiet_ || !lines || count < 1) return;
  bool blank = std::all_of(lines, lines + count, [](const wchar_t* line) {
    return !line ||
           std::all_of(line, line + std::wcslen(line), [](wchar_t c) { return std::iswspace(c) != 0; });
  });
  if (blank) return;
  if (progress_) progress_->Clear();
  if (!color_) return Port_MsgManDefault::writeMsgLines(type, lines, count);
  const std::string prefix = typePrefix(type);
  std::string text =
      FormatLines(TerminalColor::Painted(prefix, SeverityOf(type)), prefix.size(), lines, count);
  std::fwrite(text.data(), 1, text.size(), stderr);
}

void MessageLog::writeMsgEnd(MsgType type) {
  if (!quiet_) Port_MsgManDefault::writeMsgEnd(type);
}

}  // namespace quillon
