// A message manager that keeps the messages it takes instead of writing them.
#pragma once

#include <vector>

#include "Port/MsgManDefault.h"

// Counts, filters and flags like Port_MsgManDefault; the records of the messages it takes are kept
// in arrival order and nothing is written. Not registered by itself: pass it to
// Port_MsgDispatcher::addMsgMan.
class Port_MsgCollector : public Port_MsgManDefault {
 public:
  explicit Port_MsgCollector(const char* name = nullptr) : Port_MsgManDefault(name) {}

  void writeMsgLines(MsgType type, const wchar_t* const* lines, int count) override;
  void writeMsgEnd(MsgType type) override;
  void onMessage(const Port_MsgRecord& record) override;

  const std::vector<Port_MsgRecord>& records() const { return records_; }
  void clearRecords() { records_.clear(); }

 private:
  std::vector<Port_MsgRecord> records_;
};
