// The working message manager: counts, filters, formats, and writes to standard error.
#pragma once

#include <array>
#include <cstdarg>
#include <set>
#include <string>

#include "Port/MsgMan.h"

// Subclasses change where messages go by overriding the output hooks (writeMsgLines, writeMsgEnd)
// or watch them structured through onMessage; everything else works as declared in Port_MsgMan.
// Its virtual operations keep the slot order of Port_MsgMan.
class Port_MsgManDefault : public Port_MsgMan {
 public:
  // A null name is taken as empty.
  explicit Port_MsgManDefault(const char* name = nullptr);
  Port_MsgManDefault(const Port_MsgManDefault&) = delete;
  Port_MsgManDefault& operator=(const Port_MsgManDefault&) = delete;

  const std::string& getName() const { return name_; }

  ~Port_MsgManDefault() override;

  void setClean(bool clean) override;
  bool getClean() const override;
  void setAbortFlag(bool abort) override;
  bool getAbortFlag() const override;

  // Writes the lines to standard error, the first after the type's prefix, the others indented to
  // line up with it.
  void writeMsgLines(MsgType type, const wchar_t* const* lines, int count) override;
  void writeMsgEnd(MsgType type) override;

  void msgFormat(MsgType type, const char* text) override;
  void setMaxLineWidth(int width) override;
  int getMaxLineWidth() const override;
  void flush() override;

  void enable() override;
  void disable() override;
  bool isEnabled() const override;

  void msgMessage(MsgType type, const char* text) override;
  void printMsg(MsgType type, const char* format, ...) override __attribute__((format(printf, 3, 4)));
  void printMsg(MsgType type, int msgNum, const char* format, ...) override
      __attribute__((format(printf, 4, 5)));

  void msgStatus(const char* format, ...) override __attribute__((format(printf, 2, 3)));
  void msgError(const char* format, ...) override __attribute__((format(printf, 2, 3)));
  void msgInfo(const char* format, ...) override __attribute__((format(printf, 2, 3)));
  void msgWarning(const char* format, ...) override __attribute__((format(printf, 2, 3)));
  void msgInternal(const char* format, ...) override __attribute__((format(printf, 2, 3)));
  void msgFatal(const char* format, ...) override __attribute__((format(printf, 2, 3)));
  void msgUserFatal(const char* format, ...) override __attribute__((format(printf, 2, 3)));
  void msgDebug(const char* format, ...) override __attribute__((format(printf, 2, 3)));

  void msgStatusByNum(int msgNum, const char* format, ...) override __attribute__((format(printf, 3, 4)));
  void msgErrorByNum(int msgNum, const char* format, ...) override __attribute__((format(printf, 3, 4)));
  void msgInfoByNum(int msgNum, const char* format, ...) override __attribute__((format(printf, 3, 4)));
  void msgWarningByNum(int msgNum, const char* format, ...) override __attribute__((format(printf, 3, 4)));
  void msgInternalByNum(int msgNum, const char* format, ...) override __attribute__((format(printf, 3, 4)));
  void msgFatalByNum(int msgNum, const char* format, ...) override __attribute__((format(printf, 3, 4)));
  void msgUserFatalByNum(int msgNum, const char* format, ...) override __attribute__((format(printf, 3, 4)));
  void msgDebugByNum(int msgNum, const char* format, ...) override __attribute__((format(printf, 3, 4)));

  int getStatCount() const override;
  int getErrCount() const override;
  int getWarnCount() const override;
  int getInfoCount() const override;
  int getIntCount() const override;
  int getFatalCount() const override;
  int getUserFatalCount() const override;
  int getDbgCount() const override;

  void resetStatCount() override;
  void resetErrCount() override;
  void resetWarnCount() override;
  void resetInfoCount() override;
  void resetIntCount() override;
  void resetFatalCount() override;
  void resetUserFatalCount() override;
  void resetDbgCount() override;

  void turnOffMsg(int msgNum) override;
  void turnOnMsg(int msgNum) override;
  bool isMsgOn(int msgNum) const override;

  // Does nothing here.
  void onMessage(const Port_MsgRecord& record) override;
  // Drops the message when the manager is disabled or its number is turned off; otherwise calls
  // onMessage, counts it, updates the clean and abort flags and formats it (msgFormat).
  void deliverMsg(const Port_MsgRecord& record) override;

 protected:
  // The lines of one message as written: `prefix` before the first, blanks of `indentWidth` before
  // the others, each ended by '\n'. A subclass that decorates the prefix keeps the layout.
  static std::string FormatLines(const std::string& prefix, std::size_t indentWidth,
                                 const wchar_t* const* lines, int count);

 private:
  void deliverFormatted(MsgType type, int msgNum, const char* format, std::va_list args);
  void deliverText(MsgType type, int msgNum, std::string text);
  int countOf(MsgType type) const;
  void resetCount(MsgType type);
  void noteTaken(MsgType type);

  std::string name_;
  bool enabled_ = true;
  bool clean_ = true;
  bool abort_ = false;
  int maxLineWidth_ = 0;
  std::array<int, kMsgTypeCount> counts_{};
  std::set<int> silencedNumbers_;
};
