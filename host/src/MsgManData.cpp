#include "Port/MsgManData.h"

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <utility>

#include "MsgText.h"
#include "Port/MsgDispatcher.h"

namespace {

// Never destroyed: developer texts may be written from static destructors.
Port_MsgManData::DebugSink& DebugSinkSlot() {
  static auto* sink = new Port_MsgManData::DebugSink;
  return *sink;
}

bool DebugEchoRequested() {
  const char* value = std::getenv("QUILLON_DEBUG");
  return value && *value && std::strcmp(value, "0") != 0;
}

void WriteDebugText(std::string_view text) {
  if (DebugEchoRequested()) {
    std::fwrite(text.data(), 1, text.size(), stderr);
    std::fflush(stderr);
  }
  // A sink that writes developer texts itself must not recurse into itself.
  static bool inSink = false;
  Port_MsgManData::DebugSink& sink = DebugSinkSlot();
  if (sink && !inSink) {
    inSink = true;
    sink(text);
    inSink = false;
  }
}

std::string TextOrEmpty(const char* text) { return text ? text : ""; }

}  // namespace

// Every variadic issue operation forwards here with its type.
#define PORT_ISSUE_FORWARD(type, format) \
  do {                                   \
    std::va_list args;                   \
    va_start(args, format);              \
    issueV((type), format, args);        \
    va_end(args);                        \
  } while (false)

Port_MsgManData::Port_MsgManData(const char* category, const char* sourceFile, int line, const char* revision)
    : category_(TextOrEmpty(category)),
      sourceFile_(TextOrEmpty(sourceFile)),
      line_(line),
      revision_(TextOrEmpty(revision)) {}

std::unique_ptr<Port_MsgManData> Port_MsgManData::createObject(const char* category, const char* sourceFile,
                                                               int line, const char* revision) {
  return std::make_unique<Port_MsgManData>(category, sourceFile, line, revision);
}

void Port_MsgManData::issueError(const char* format, ...) { PORT_ISSUE_FORWARD(Port_MsgMan::kError, format); }
void Port_MsgManData::issueWarning(const char* format, ...) {
  PORT_ISSUE_FORWARD(Port_MsgMan::kWarning, format);
}
void Port_MsgManData::issueInfo(const char* format, ...) { PORT_ISSUE_FORWARD(Port_MsgMan::kInfo, format); }

#undef PORT_ISSUE_FORWARD

void Port_MsgManData::issueV(Port_MsgMan::MsgType type, const char* format, std::va_list args) {
  if (!format) {
    debugStub("ERROR: Port_MsgManData::issue - message without a format dropped (%s:%d)\n",
              sourceFile_.c_str(), line_);
    return;
  }
  Port_MsgRecord record;
  record.type = type;
  record.text = Port::MsgText::FormatV(format, args);
  record.category = category_;
  record.sourceFile = sourceFile_;
  record.line = line_;
  record.revision = revision_;
  Port_MsgDispatcher::dispatch(record);
}

void Port_MsgManData::debugStub(const char* format, ...) {
  if (!format) return;
  std::va_list args;
  va_start(args, format);
  std::string text = Port::MsgText::FormatV(format, args);
  va_end(args);
  WriteDebugText(text);
}

Port_MsgManData::DebugSink Port_MsgManData::setDebugSink(DebugSink sink) {
  return std::exchange(DebugSinkSlot(), std::move(sink));
}

Port_DebugCapture::Port_DebugCapture()
    : previous_(Port_MsgManData::setDebugSink([this](std::string_view text) { text_.append(text); })) {}

Port_DebugCapture::~Port_DebugCapture() { Port_MsgManData::setDebugSink(std::move(previous_)); }
