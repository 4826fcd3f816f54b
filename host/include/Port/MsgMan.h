// The host's message manager interface and the record of one message.
#pragma once

#include <string>

struct Port_MsgRecord;

// A message manager receives the messages of the process (through Port_MsgDispatcher) or of direct
// calls, counts them by type and writes them somewhere. Managers live on the host's calling
// thread; none of the operations is thread-safe.
//
// The virtual operations are declared in slot order; classes outside the host library derive from
// Port_MsgManDefault and rely on it. New operations go after isMsgOn only.
class Port_MsgMan {
 public:
  enum MsgType : int {
    kError = 0,
    kWarning = 1,
    kInfo = 2,
    kStatus = 3,
    kInternal = 4,
    kFatal = 5,
    kUserFatal = 6,
    kDebug = 7,
  };
  static constexpr int kMsgTypeCount = 8;

  // True for the eight types above; any other value counts nowhere and is written with a neutral
  // prefix.
  static bool isValidType(MsgType type) { return type >= kError && type <= kDebug; }
  // "error", "warning", "info", "status", "internal", "fatal", "user fatal", "debug"; "unknown".
  static const char* typeName(MsgType type);
  // What the default output puts before the first line: "ERROR: ", "WARNING: ", "INFO: ", ...
  static const char* typePrefix(MsgType type);

  // A manager unregisters itself from the dispatcher when destroyed.
  virtual ~Port_MsgMan();

  // Clean: no error, internal, fatal or user fatal message arrived since construction or the last
  // setClean(true).
  virtual void setClean(bool clean) = 0;
  virtual bool getClean() const = 0;
  // Set by a fatal or user fatal message; cleared only by setAbortFlag(false).
  virtual void setAbortFlag(bool abort) = 0;
  virtual bool getAbortFlag() const = 0;

  // Output hooks. writeMsgLines receives the formatted lines of one message (count >= 1, every
  // line a terminated wide string without its line break); writeMsgEnd follows once per message.
  virtual void writeMsgLines(MsgType type, const wchar_t* const* lines, int count) = 0;
  virtual void writeMsgEnd(MsgType type) = 0;

  // Splits `text` into lines at '\n' (a final '\n' ends the last line), wraps them at the maximum
  // line width and hands them to the output hooks. Null text is written as one empty line.
  virtual void msgFormat(MsgType type, const char* text) = 0;
  // 0 (the default) or a negative width: no wrapping.
  virtual void setMaxLineWidth(int width) = 0;
  virtual int getMaxLineWidth() const = 0;
  virtual void flush() = 0;

  // A disabled manager takes no messages: nothing is counted, nothing written.
  virtual void enable() = 0;
  virtual void disable() = 0;
  virtual bool isEnabled() const = 0;

  // One unnumbered message of the given type with a ready text (no format).
  virtual void msgMessage(MsgType type, const char* text) = 0;
  // printf-style; the second form carries a message number (see turnOffMsg). Here and below, a
  // null format delivers nothing and is reported on the debug channel.
  virtual void printMsg(MsgType type, const char* format, ...) __attribute__((format(printf, 3, 4))) = 0;
  virtual void printMsg(MsgType type, int msgNum, const char* format, ...)
      __attribute__((format(printf, 4, 5))) = 0;

  // printf-style, one per type.
  virtual void msgStatus(const char* format, ...) __attribute__((format(printf, 2, 3))) = 0;
  virtual void msgError(const char* format, ...) __attribute__((format(printf, 2, 3))) = 0;
  virtual void msgInfo(const char* format, ...) __attribute__((format(printf, 2, 3))) = 0;
  virtual void msgWarning(const char* format, ...) __attribute__((format(printf, 2, 3))) = 0;
  virtual void msgInternal(const char* format, ...) __attribute__((format(printf, 2, 3))) = 0;
  virtual void msgFatal(const char* format, ...) __attribute__((format(printf, 2, 3))) = 0;
  virtual void msgUserFatal(const char* format, ...) __attribute__((format(printf, 2, 3))) = 0;
  virtual void msgDebug(const char* format, ...) __attribute__((format(printf, 2, 3))) = 0;

  // The same with a message number.
  virtual void msgStatusByNum(int msgNum, const char* format, ...) __attribute__((format(printf, 3, 4))) = 0;
  virtual void msgErrorByNum(int msgNum, const char* format, ...) __attribute__((format(printf, 3, 4))) = 0;
  virtual void msgInfoByNum(int msgNum, const char* format, ...) __attribute__((format(printf, 3, 4))) = 0;
  virtual void msgWarningByNum(int msgNum, const char* format, ...) __attribute__((format(printf, 3, 4))) = 0;
  virtual void msgInternalByNum(int msgNum, const char* format, ...)
      __attribute__((format(printf, 3, 4))) = 0;
  virtual void msgFatalByNum(int msgNum, const char* format, ...) __attribute__((format(printf, 3, 4))) = 0;
  virtual void msgUserFatalByNum(int msgNum, const char* format, ...)
      __attribute__((format(printf, 3, 4))) = 0;
  virtual void msgDebugByNum(int msgNum, const char* format, ...) __attribute__((format(printf, 3, 4))) = 0;

  // Messages taken since construction or the last reset, by type.
  virtual int getStatCount() const = 0;
  virtual int getErrCount() const = 0;
  virtual int getWarnCount() const = 0;
  virtual int getInfoCount() const = 0;
  virtual int getIntCount() const = 0;
  virtual int getFatalCount() const = 0;
  virtual int getUserFatalCount() const = 0;
  virtual int getDbgCount() const = 0;

  virtual void resetStatCount() = 0;
  virtual void resetErrCount() = 0;
  virtual void resetWarnCount() = 0;
  virtual void resetInfoCount() = 0;
  virtual void resetIntCount() = 0;
  virtual void resetFatalCount() = 0;
  virtual void resetUserFatalCount() = 0;
  virtual void resetDbgCount() = 0;

  // Silences the messages that carry the number (a positive one; unnumbered messages, number 0,
  // cannot be silenced and other numbers are ignored).
  virtual void turnOffMsg(int msgNum) = 0;
  virtual void turnOnMsg(int msgNum) = 0;
  virtual bool isMsgOn(int msgNum) const = 0;

  // Structured hook: called with every message the manager takes, before it is formatted.
  virtual void onMessage(const Port_MsgRecord& record) = 0;
  // The entry of one message into this manager; the dispatcher calls it for every registered and
  // enabled manager.
  virtual void deliverMsg(const Port_MsgRecord& record) = 0;
};

// One message with where it came from. Messages made by a manager's own msg... operations have no
// category, source or revision and line 0.
struct Port_MsgRecord {
  Port_MsgMan::MsgType type = Port_MsgMan::kInfo;
  std::string text;
  std::string category;
  std::string sourceFile;
  int line = 0;
  std::string revision;
  int number = 0;  // 0: unnumbered
};
