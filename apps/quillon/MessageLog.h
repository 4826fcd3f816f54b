// The message manager of quillon: takes the messages of the host message system (the module's
// and quillon's own), keeps them for the JSON output, and writes them to standard error as
// "ERROR: ", "WARNING: " or "INFO: " lines unless quiet.
#pragma once

#include <string_view>
#include <vector>

#include "CycleListings.h"
#include "DesignModel.h"
#include "Port/MsgManData.h"
#include "Port/MsgManDefault.h"
#include "Progress.h"

namespace quillon {

class MessageLog : public Port_MsgManDefault {
 public:
  // Registers itself with the dispatcher in place of the default manager; `verbose` also sends
  // the developer texts to standard error. Both are undone on destruction. `color` paints the
  // severity prefixes.
  MessageLog(bool quiet, bool verbose, bool color);
  ~MessageLog() override;

  // An error message of quillon itself, through the message system like any other.
  void ReportError(std::string_view text);
  void ReportWarning(std::string_view text);

  // A progress line to take off the terminal before a message is written; null for none.
  void SetProgress(Progress* progress) { progress_ = progress; }

  const std::vector<MessageInfo>& messages() const { return messages_; }
  // Every message as it arrived, for the parse cache to keep with the file that issued it.
  const std::vector<Port_MsgRecord>& received() const { return received_; }
  // True once an error (or worse) arrived.
  bool HasErrors() const;
  // From now on the syntax errors of source files (SourceFileCheck::IsSyntaxError) are only kept
  // in received(): neither written, counted nor listed, for `check` reports them as diagnostics.
  void DivertSyntaxErrors() { divertSyntaxErrors_ = true; }

  // True once the module cut file dependency cycles to give an order that is not valid.
  bool OrderWasCut() const { return cycles_.OrderWasCut(); }

  // A cycle listing that repeats one given before (the relaxed rule meeting the strict rule's
  // cycle again) is dropped.
  void deliverMsg(const Port_MsgRecord& record) override;
  void onMessage(const Port_MsgRecord& record) override;
  void writeMsgLines(MsgType type, const wchar_t* const* lines, int count) override;
  void writeMsgEnd(MsgType type) override;

 private:
  bool quiet_;
  bool color_;
  Progress* progress_ = nullptr;
  bool defaultWasRegistered_ = false;
  bool sinkInstalled_ = false;
  bool divertSyntaxErrors_ = false;
  Port_MsgManData::DebugSink previousSink_;
  std::vector<MessageInfo> messages_;
  std::vector<Port_MsgRecord> received_;
  CycleListings cycles_;
};

}  // namespace quillon
