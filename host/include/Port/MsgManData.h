// Issuing messages with their origin, and the developer debug channel.
#pragma once

#include <cstdarg>
#include <functional>
#include <memory>
#include <string>
#include <string_view>

#include "Port/MsgMan.h"

// A message source: category, source file, line and revision, stamped on every message issued
// through it. Each issue... call delivers one message through Port_MsgDispatcher.
class Port_MsgManData {
 public:
  using DebugSink = std::function<void(std::string_view)>;

  // Null texts are taken as empty.
  Port_MsgManData(const char* category, const char* sourceFile, int line, const char* revision);
  static std::unique_ptr<Port_MsgManData> createObject(const char* category, const char* sourceFile, int line,
                                                       const char* revision);

  const std::string& category() const { return category_; }
  const std::string& sourceFile() const { return sourceFile_; }
  int line() const { return line_; }
  const std::string& revision() const { return revision_; }

  // printf-style, texts of any length. A null format delivers nothing and is reported on the debug
  // channel.
  void issueError(const char* format, ...) __attribute__((format(printf, 2, 3)));
  void issueWarning(const char* format, ...) __attribute__((format(printf, 2, 3)));
  void issueInfo(const char* format, ...) __attribute__((format(printf, 2, 3)));
  void issueV(Port_MsgMan::MsgType type, const char* format, std::va_list args);

  // Developer text: never reaches the message managers. It goes to the installed debug sink, and
  // to standard error when the environment variable QUILLON_DEBUG is set (to anything but "" or
  // "0"). A null format writes nothing.
  static void debugStub(const char* format, ...) __attribute__((format(printf, 1, 2)));
  // Installs `sink` (an empty one removes it) and returns the one installed before.
  static DebugSink setDebugSink(DebugSink sink);

 private:
  std::string category_;
  std::string sourceFile_;
  int line_;
  std::string revision_;
};

// While it lives, developer texts are gathered into text() instead of the sink installed before,
// which is put back on destruction. Captures nest when they end in reverse order, as scoped objects
// do.
class Port_DebugCapture {
 public:
  Port_DebugCapture();
  ~Port_DebugCapture();
  Port_DebugCapture(const Port_DebugCapture&) = delete;
  Port_DebugCapture& operator=(const Port_DebugCapture&) = delete;

  const std::string& text() const { return text_; }
  void clear() { text_.clear(); }

 private:
  std::string text_;
  Port_MsgManData::DebugSink previous_;
};
