// Collects the messages of one compiled file, at most a fixed number of them, so that a file full
// of junk cannot flood the host; the collected messages are issued to the host afterwards.
#pragma once

#include <cstdarg>
#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

#include "vci/VerilogMessage.h"

namespace Hx_Vci {

class VerilogMessageLog {
 public:
  static constexpr std::size_t kDefaultLimit = 100;
  // Longest piece of source text quoted in a message.
  static constexpr std::size_t kQuoteLimit = 60;

  explicit VerilogMessageLog(std::size_t limit = kDefaultLimit) : limit_(limit) {}

  // printf-style; beyond the limit one last message says that the rest is not reported.
  void Error(const std::string& file, int line, const char* format, ...)
      __attribute__((format(printf, 4, 5)));
  void Warning(const std::string& file, int line, const char* format, ...)
      __attribute__((format(printf, 4, 5)));
  void ReportV(VerilogSeverity severity, const std::string& file, int line, const char* format,
               std::va_list args);
  // True once nothing more is taken; lets callers skip the work of describing a problem.
  bool Full() const { return messages_.size() > limit_; }

  const std::vector<VerilogMessage>& messages() const { return messages_; }
  std::vector<VerilogMessage> Take() { return std::move(messages_); }

  static std::string Format(const char* format, ...) __attribute__((format(printf, 1, 2)));
  // `text` cut to kQuoteLimit characters, with "..." when it was longer; control bytes shown as '?'.
  static std::string Quote(std::string_view text);
  // Hands the messages to the host's message system, category "VerilogCompiler"; `withPlace`
  // also starts each text with "file:line: ", for hosts that show the text alone.
  static void Issue(const std::vector<VerilogMessage>& messages, bool withPlace = false);

 private:
  void Add(VerilogSeverity severity, const std::string& file, int line, std::string text);

  std::size_t limit_;
  std::vector<VerilogMessage> messages_;
};

}  // namespace Hx_Vci
