#include "Port/MsgManDefault.h"

#include <cstdio>
#include <string>
#include <utility>
#include <vector>

#include "MsgText.h"
#include "Port/MsgManData.h"

namespace {

bool IsErrorClass(Port_MsgMan::MsgType type) {
  return type == Port_MsgMan::kError || type == Port_MsgMan::kInternal || type == Port_MsgMan::kFatal ||
         type == Port_MsgMan::kUserFatal;
}

bool IsAbortClass(Port_MsgMan::MsgType type) {
  return type == Port_MsgMan::kFatal || type == Port_MsgMan::kUserFatal;
}

void WriteToStandardError(const std::string& text) { std::fwrite(text.data(), 1, text.size(), stderr); }

}  // namespace

// Every variadic operation of the manager forwards here with its type and number.
#define PORT_MSG_FORWARD(type, msgNum, format)        \
  do {                                                \
    std::va_list args;                                \
    va_start(args, format);                           \
    deliverFormatted((type), (msgNum), format, args); \
    va_end(args);                                     \
  } while (false)

Port_MsgManDefault::Port_MsgManDefault(const char* name) : name_(name ? name : "") {}

Port_MsgManDefault::~Port_MsgManDefault() = default;

void Port_MsgManDefault::setClean(bool clean) { clean_ = clean; }
bool Port_MsgManDefault::getClean() const { return clean_; }
void Port_MsgManDefault::setAbortFlag(bool abort) { abort_ = abort; }
bool Port_MsgManDefault::getAbortFlag() const { return abort_; }

void Port_MsgManDefault::writeMsgLines(MsgType type, const wchar_t* const* lines, int count) {
  if (!lines || count < 1) return;
  const std::string prefix = typePrefix(type);
  WriteToStandardError(FormatLines(prefix, prefix.size(), lines, count));
}

std::string Port_MsgManDefault::FormatLines(const std::string& prefix, std::size_t indentWidth,
                                            const wchar_t* const* lines, int count) {
  const std::string indent(indentWidth, ' ');
  std::string text;
  for (int i = 0; i < count; ++i) {
    text += i == 0 ? prefix : indent;
    if (lines[i]) text += Port::MsgText::Narrow(lines[i]);
    text += '\n';
  }
  return text;
}

void Port_MsgManDefault::writeMsgEnd(MsgType) { std::fflush(stderr); }

void Port_MsgManDefault::msgFormat(MsgType type, const char* text) {
  std::vector<std::wstring> lines = Port::MsgText::SplitLines(text ? text : "", maxLineWidth_);
  std::vector<const wchar_t*> linePointers;
  linePointers.reserve(lines.size());
  for (const std::wstring& line : lines) linePointers.push_back(line.c_str());
  writeMsgLines(type, linePointers.data(), static_cast<int>(linePointers.size()));
  writeMsgEnd(type);
}

void Port_MsgManDefault::setMaxLineWidth(int width) { maxLineWidth_ = width > 0 ? width : 0; }
int Port_MsgManDefault::getMaxLineWidth() const { return maxLineWidth_; }
void Port_MsgManDefault::flush() { std::fflush(stderr); }

void Port_MsgManDefault::enable() { enabled_ = true; }
void Port_MsgManDefault::disable() { enabled_ = false; }
bool Port_MsgManDefault::isEnabled() const { return enabled_; }

void Port_MsgManDefault::msgMessage(MsgType type, const char* text) {
  deliverText(type, 0, text ? text : "");
}

void Port_MsgManDefault::printMsg(MsgType type, const char* format, ...) {
  PORT_MSG_FORWARD(type, 0, format);
}
void Port_MsgManDefault::printMsg(MsgType type, int msgNum, const char* format, ...) {
  PORT_MSG_FORWARD(type, msgNum, format);
}

void Port_MsgManDefault::msgStatus(const char* format, ...) { PORT_MSG_FORWARD(kStatus, 0, format); }
void Port_MsgManDefault::msgError(const char* format, ...) { PORT_MSG_FORWARD(kError, 0, format); }
void Port_MsgManDefault::msgInfo(const char* format, ...) { PORT_MSG_FORWARD(kInfo, 0, format); }
void Port_MsgManDefault::msgWarning(const char* format, ...) { PORT_MSG_FORWARD(kWarning, 0, format); }
void Port_MsgManDefault::msgInternal(const char* format, ...) { PORT_MSG_FORWARD(kInternal, 0, format); }
void Port_MsgManDefault::msgFatal(const char* format, ...) { PORT_MSG_FORWARD(kFatal, 0, format); }
void Port_MsgManDefault::msgUserFatal(const char* format, ...) { PORT_MSG_FORWARD(kUserFatal, 0, format); }
void Port_MsgManDefault::msgDebug(const char* format, ...) { PORT_MSG_FORWARD(kDebug, 0, format); }

void Port_MsgManDefault::msgStatusByNum(int msgNum, const char* format, ...) {
  PORT_MSG_FORWARD(kStatus, msgNum, format);
}
void Port_MsgManDefault::msgErrorByNum(int msgNum, const char* format, ...) {
  PORT_MSG_FORWARD(kError, msgNum, format);
}
void Port_MsgManDefault::msgInfoByNum(int msgNum, const char* format, ...) {
  PORT_MSG_FORWARD(kInfo, msgNum, format);
}
void Port_MsgManDefault::msgWarningByNum(int msgNum, const char* format, ...) {
  PORT_MSG_FORWARD(kWarning, msgNum, format);
}
void Port_MsgManDefault::msgInternalByNum(int msgNum, const char* format, ...) {
  PORT_MSG_FORWARD(kInternal, msgNum, format);
}
void Port_MsgManDefault::msgFatalByNum(int msgNum, const char* format, ...) {
  PORT_MSG_FORWARD(kFatal, msgNum, format);
}
void Port_MsgManDefault::msgUserFatalByNum(int msgNum, const char* format, ...) {
  PORT_MSG_FORWARD(kUserFatal, msgNum, format);
}
void Port_MsgManDefault::msgDebugByNum(int msgNum, const char* format, ...) {
  PORT_MSG_FORWARD(kDebug, msgNum, format);
}

#undef PORT_MSG_FORWARD

int Port_MsgManDefault::getStatCount() const { return countOf(kStatus); }
int Port_MsgManDefault::getErrCount() const { return countOf(kError); }
int Port_MsgManDefault::getWarnCount() const { return countOf(kWarning); }
int Port_MsgManDefault::getInfoCount() const { return countOf(kInfo); }
int Port_MsgManDefault::getIntCount() const { return countOf(kInternal); }
int Port_MsgManDefault::getFatalCount() const { return countOf(kFatal); }
int Port_MsgManDefault::getUserFatalCount() const { return countOf(kUserFatal); }
int Port_MsgManDefault::getDbgCount() const { return countOf(kDebug); }

void Port_MsgManDefault::resetStatCount() { resetCount(kStatus); }
void Port_MsgManDefault::resetErrCount() { resetCount(kError); }
void Port_MsgManDefault::resetWarnCount() { resetCount(kWarning); }
void Port_MsgManDefault::resetInfoCount() { resetCount(kInfo); }
void Port_MsgManDefault::resetIntCount() { resetCount(kInternal); }
void Port_MsgManDefault::resetFatalCount() { resetCount(kFatal); }
void Port_MsgManDefault::resetUserFatalCount() { resetCount(kUserFatal); }
void Port_MsgManDefault::resetDbgCount() { resetCount(kDebug); }

void Port_MsgManDefault::turnOffMsg(int msgNum) {
  if (msgNum > 0) silencedNumbers_.insert(msgNum);
}
void Port_MsgManDefault::turnOnMsg(int msgNum) { silencedNumbers_.erase(msgNum); }
bool Port_MsgManDefault::isMsgOn(int msgNum) const { return !silencedNumbers_.contains(msgNum); }

void Port_MsgManDefault::onMessage(const Port_MsgRecord&) {}

void Port_MsgManDefault::deliverMsg(const Port_MsgRecord& record) {
  if (!isEnabled() || !isMsgOn(record.number)) return;
  onMessage(record);
  noteTaken(record.type);
  msgFormat(record.type, record.text.c_str());
}

void Port_MsgManDefault::deliverFormatted(MsgType type, int msgNum, const char* format, std::va_list args) {
  if (!format) {
    Port_MsgManData::debugStub(
        "ERROR: Port_MsgManDefault - message without a format dropped (manager \"%s\")\n", name_.c_str());
    return;
  }
  deliverText(type, msgNum, Port::MsgText::FormatV(format, args));
}

void Port_MsgManDefault::deliverText(MsgType type, int msgNum, std::string text) {
  Port_MsgRecord record;
  record.type = type;
  record.number = msgNum;
  record.text = std::move(text);
  deliverMsg(record);
}

int Port_MsgManDefault::countOf(MsgType type) const { return isValidType(type) ? counts_[type] : 0; }

void Port_MsgManDefault::resetCount(MsgType type) {
  if (isValidType(type)) counts_[type] = 0;
}

void Port_MsgManDefault::noteTaken(MsgType type) {
  if (isValidType(type)) ++counts_[type];
  if (IsErrorClass(type)) clean_ = false;
  if (IsAbortClass(type)) abort_ = true;
}
