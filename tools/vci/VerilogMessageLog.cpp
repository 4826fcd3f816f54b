#include "vci/VerilogMessageLog.h"

#include <cstdarg>
#include <cstdio>
#include <memory>
#include <utility>

#include "Port/MsgManData.h"
#include "vci/VerilogMessageText.h"

namespace Hx_Vci {

namespace {

std::string FormatV(const char* format, std::va_list args) {
  std::va_list measure;
  va_copy(measure, args);
  int length = std::vsnprintf(nullptr, 0, format, measure);
  va_end(measure);
  if (length <= 0) {
    return std::string();
  }
  std::string text(static_cast<std::size_t>(length) + 1, '\0');
  std::vsnprintf(text.data(), text.size(), format, args);
  text.resize(static_cast<std::size_t>(length));
  return text;
}

}  // namespace

void VerilogMessageLog::Error(const std::string& file, int line, const char* format, ...) {
  std::va_list args;
  va_start(args, format);
  ReportV(VerilogSeverity::kError, file, line, format, args);
  va_end(args);
}

void VerilogMessageLog::Warning(const std::string& file, int line, const char* format, ...) {
  std::va_list args;
  va_start(args, format);
  ReportV(VerilogSeverity::kWarning, file, line, format, args);
  va_end(args);
}

void VerilogMessageLog::ReportV(VerilogSeverity severity, const std::string& file, int line,
                                const char* format, std::va_list args) {
  if (Full()) {
    return;
  }
  Add(severity, file, line, FormatV(format, args));
}

void VerilogMessageLog::Add(VerilogSeverity severity, const std::string& file, int line, std::string text) {
  if (messages_.size() == limit_) {
    messages_.push_back({VerilogSeverity::kWarning, file, line, VerilogMessageText::kTooManyMessages});
    return;
  }
  messages_.push_back({severity, file, line, std::move(text)});
}

std::string VerilogMessageLog::Format(const char* format, ...) {
  std::va_list args;
  va_start(args, format);
  std::string text = FormatV(format, args);
  va_end(args);
  return text;
}

std::string VerilogMessageLog::Quote(std::string_view text) {
  std::string quoted(text.substr(0, kQuoteLimit));
  for (char& c : quoted) {
    unsigned char byte = static_cast<unsigned char>(c);
    if (byte < 0x20 || byte >= 0x7f) {
      c = '?';
    }
  }
  if (text.size() > kQuoteLimit) {
    quoted += "...";
  }
  return quoted;
}

void VerilogMessageLog::Issue(const std::vector<VerilogMessage>& messages, bool withPlace) {
  for (const VerilogMessage& message : messages) {
    std::unique_ptr<Port_MsgManData> source =
        Port_MsgManData::createObject("VerilogCompiler", message.file.c_str(), message.line, "");
    std::string text = message.text;
    if (withPlace && !message.file.empty())
      text = message.file + ":" + std::to_string(message.line) + ": " + text;
    if (message.severity == VerilogSeverity::kError) {
      source->issueError("%s\n", text.c_str());
    } else {
      source->issueWarning("%s\n", text.c_str());
    }
  }
}

}  // namespace Hx_Vci
