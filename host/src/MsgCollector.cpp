#include "Port/MsgCollector.h"

void Port_MsgCollector::writeMsgLines(MsgType, const wchar_t* const*, int) {}
void Port_MsgCollector::writeMsgEnd(MsgType) {}
void Port_MsgCollector::onMessage(const Port_MsgRecord& record) { records_.push_back(record); }
