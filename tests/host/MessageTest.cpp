#include <gtest/gtest.h>

#include <cstdlib>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "IsolatedDispatcher.h"
#include "Port/MsgCollector.h"
#include "Port/MsgDispatcher.h"
#include "Port/MsgManData.h"
#include "Port/MsgManDefault.h"

namespace {

class MessageTest : public testing::Test {
 protected:
  IsolatedDispatcher isolation_;
};

struct WrittenMessage {
  Port_MsgMan::MsgType type;
  std::vector<std::wstring> lines;
  bool ended = false;
};

// Records what the base class hands to the output hooks.
class LineRecorder : public Port_MsgManDefault {
 public:
  void writeMsgLines(MsgType type, const wchar_t* const* lines, int count) override {
    written.push_back({type, std::vector<std::wstring>(lines, lines + count)});
  }
  void writeMsgEnd(MsgType type) override {
    ASSERT_FALSE(written.empty());
    EXPECT_EQ(written.back().type, type);
    written.back().ended = true;
  }
  std::vector<WrittenMessage> written;
};

// The counts of status, error, warning, info, internal, fatal, user-fatal and debug messages.
std::string Counts(const Port_MsgMan& man) {
  return std::to_string(man.getStatCount()) + " " + std::to_string(man.getErrCount()) + " " +
         std::to_string(man.getWarnCount()) + " " + std::to_string(man.getInfoCount()) + " " +
         std::to_string(man.getIntCount()) + " " + std::to_string(man.getFatalCount()) + " " +
         std::to_string(man.getUserFatalCount()) + " " + std::to_string(man.getDbgCount());
}

std::unique_ptr<Port_MsgManData> ElaboratorSource() {
  return Port_MsgManData::createObject("ProjectMgmt", "../src/CElaborator", 42, "1.7");
}

TEST_F(MessageTest, IssuedMessagesReachEveryRegisteredManagerWithTheirOrigin) {
  Port_MsgCollector first, second;
  ASSERT_TRUE(Port_MsgDispatcher::addMsgMan(&first));
  ASSERT_TRUE(Port_MsgDispatcher::addMsgMan(&second));

  auto source = ElaboratorSource();
  source->issueError("Unit %s not found\n", "cpu");
  source->issueWarning("Circular Reference: %s\n", "top");
  source->issueInfo("Duplicate name in ProcessElement(): %s\n", "alu");

  for (const Port_MsgCollector* man : {&first, &second}) {
    ASSERT_EQ(man->records().size(), 3u);
    const Port_MsgRecord& error = man->records()[0];
    EXPECT_EQ(error.type, Port_MsgMan::kError);
    EXPECT_EQ(error.text, "Unit cpu not found\n");
    EXPECT_EQ(error.category, "ProjectMgmt");
    EXPECT_EQ(error.sourceFile, "../src/CElaborator");
    EXPECT_EQ(error.line, 42);
    EXPECT_EQ(error.revision, "1.7");
    EXPECT_EQ(man->records()[1].type, Port_MsgMan::kWarning);
    EXPECT_EQ(man->records()[1].text, "Circular Reference: top\n");
    EXPECT_EQ(man->records()[2].type, Port_MsgMan::kInfo);
    EXPECT_EQ(Counts(*man), "0 1 1 1 0 0 0 0");
  }
}

TEST_F(MessageTest, DisabledAndRemovedManagersReceiveNothing) {
  Port_MsgCollector disabled, removed, listening;
  for (Port_MsgCollector* man : {&disabled, &removed, &listening}) Port_MsgDispatcher::addMsgMan(man);
  disabled.disable();
  EXPECT_TRUE(Port_MsgDispatcher::removeMsgMan(&removed));
  EXPECT_FALSE(Port_MsgDispatcher::removeMsgMan(&removed));

  ElaboratorSource()->issueError("lost?");

  EXPECT_TRUE(disabled.records().empty());
  EXPECT_EQ(disabled.getErrCount(), 0);
  EXPECT_TRUE(removed.records().empty());
  EXPECT_EQ(listening.records().size(), 1u);

  disabled.enable();
  ElaboratorSource()->issueError("again");
  EXPECT_EQ(disabled.records().size(), 1u);
}

TEST_F(MessageTest, ManagersAreListedInRegistrationOrderWithoutDuplicatesUntilDestroyed) {
  Port_MsgCollector a, b, c;
  EXPECT_TRUE(Port_MsgDispatcher::addMsgMan(&a));
  EXPECT_TRUE(Port_MsgDispatcher::addMsgMan(&b));
  EXPECT_TRUE(Port_MsgDispatcher::addMsgMan(&c));
  EXPECT_FALSE(Port_MsgDispatcher::addMsgMan(&a));
  EXPECT_FALSE(Port_MsgDispatcher::addMsgMan(nullptr));

  std::vector<Port_MsgMan*> mans{&c};  // replaced, not appended to
  Port_MsgDispatcher::getAllMsgMans(mans);
  EXPECT_EQ(mans, (std::vector<Port_MsgMan*>{&a, &b, &c}));

  Port_MsgDispatcher::removeMsgMan(&b);
  Port_MsgDispatcher::addMsgMan(&b);
  {
    Port_MsgCollector shortLived;  // unregisters itself when destroyed
    Port_MsgDispatcher::addMsgMan(&shortLived);
  }
  Port_MsgDispatcher::getAllMsgMans(mans);
  EXPECT_EQ(mans, (std::vector<Port_MsgMan*>{&a, &c, &b}));
  ElaboratorSource()->issueError("heard by a, c and b only");
  EXPECT_EQ(b.records().size(), 1u);
}

TEST(MessageDispatcher, DefaultManagerIsRegisteredAndStable) {
  Port_MsgManDefault* defaultMan = Port_MsgDispatcher::getDefaultMsgMan();
  ASSERT_NE(defaultMan, nullptr);
  EXPECT_EQ(Port_MsgDispatcher::getDefaultMsgMan(), defaultMan);
  EXPECT_TRUE(Port_MsgDispatcher::isRegistered(defaultMan));
  {
    IsolatedDispatcher isolation;
    EXPECT_FALSE(Port_MsgDispatcher::isRegistered(defaultMan));
    EXPECT_EQ(Port_MsgDispatcher::getDefaultMsgMan(), defaultMan);
  }
  EXPECT_TRUE(Port_MsgDispatcher::isRegistered(defaultMan));
}

// Removes `victim` from the dispatcher when the first message arrives.
class RemovingCollector : public Port_MsgCollector {
 public:
  explicit RemovingCollector(Port_MsgMan* victim) : victim_(victim) {}
  void onMessage(const Port_MsgRecord& record) override {
    Port_MsgCollector::onMessage(record);
    Port_MsgDispatcher::removeMsgMan(victim_);
  }

 private:
  Port_MsgMan* victim_;
};

TEST_F(MessageTest, ManagerRemovedDuringDeliveryGetsNothingMore) {
  Port_MsgCollector later;
  RemovingCollector remover(&later);
  Port_MsgDispatcher::addMsgMan(&remover);
  Port_MsgDispatcher::addMsgMan(&later);

  ElaboratorSource()->issueWarning("first");

  EXPECT_EQ(remover.records().size(), 1u);
  EXPECT_TRUE(later.records().empty());
}

TEST_F(MessageTest, OutputHooksReceiveTheLinesOfEachMessageWithItsType) {
  LineRecorder recorder;
  Port_MsgDispatcher::addMsgMan(&recorder);
  auto source = ElaboratorSource();
  source->issueError("Found circular dependency:\n          %s\n", "a.vhd");
  source->issueWarning("\n");
  source->issueInfo("blank\n\nline");
  Port_MsgRecord status;
  status.type = Port_MsgMan::kStatus;
  status.text = "parsing";
  Port_MsgDispatcher::dispatch(status);

  ASSERT_EQ(recorder.written.size(), 4u);
  EXPECT_EQ(recorder.written[0].type, Port_MsgMan::kError);
  EXPECT_EQ(recorder.written[0].lines,
            (std::vector<std::wstring>{L"Found circular dependency:", L"          a.vhd"}));
  EXPECT_EQ(recorder.written[1].type, Port_MsgMan::kWarning);
  EXPECT_EQ(recorder.written[1].lines, std::vector<std::wstring>{L""});
  EXPECT_EQ(recorder.written[2].type, Port_MsgMan::kInfo);
  EXPECT_EQ(recorder.written[2].lines, (std::vector<std::wstring>{L"blank", L"", L"line"}));
  EXPECT_EQ(recorder.written[3].type, Port_MsgMan::kStatus);
  EXPECT_EQ(recorder.written[3].lines, std::vector<std::wstring>{L"parsing"});
  for (const WrittenMessage& message : recorder.written) EXPECT_TRUE(message.ended);
  EXPECT_EQ(recorder.getStatCount(), 1);
}

TEST(MessageFormat, LinesWrapAtTheMaximumWidth) {
  LineRecorder recorder;
  recorder.setMaxLineWidth(10);
  recorder.msgInfo("alpha beta gamma delta\nabcdefghijklmnopqrstuvw");
  recorder.setMaxLineWidth(5);
  recorder.msgInfo("abcde fghij");
  recorder.setMaxLineWidth(-3);
  EXPECT_EQ(recorder.getMaxLineWidth(), 0);
  recorder.msgInfo("no wrapping at all here");

  ASSERT_EQ(recorder.written.size(), 3u);
  EXPECT_EQ(recorder.written[0].lines, (std::vector<std::wstring>{L"alpha beta", L"gamma", L"delta",
                                                                  L"abcdefghij", L"klmnopqrst", L"uvw"}));
  EXPECT_EQ(recorder.written[1].lines, (std::vector<std::wstring>{L"abcde", L"fghij"}));
  EXPECT_EQ(recorder.written[2].lines, std::vector<std::wstring>{L"no wrapping at all here"});
}

TEST(MessageFormat, DefaultOutputGoesToStandardErrorWithTypePrefixes) {
  Port_MsgManDefault man("plain");
  EXPECT_EQ(man.getName(), "plain");
  testing::internal::CaptureStderr();
  man.msgError("bad %s\nthing", "unit");
  man.msgWarning("careful");
  man.msgInfo("note");
  man.msgStatus("busy");
  man.msgMessage(static_cast<Port_MsgMan::MsgType>(42), "odd");
  EXPECT_EQ(testing::internal::GetCapturedStderr(),
            "ERROR: bad unit\n       thing\nWARNING: careful\nINFO: note\nSTATUS: busy\nMESSAGE: odd\n");
}

TEST(MessageCounts, EachTypeCountsSeparatelyAndSetsTheFlags) {
  Port_MsgCollector man;
  EXPECT_TRUE(man.getClean());
  man.msgStatus("s");
  man.msgWarning("w");
  man.msgWarning("w");
  man.msgInfo("i");
  man.msgDebug("d");
  EXPECT_TRUE(man.getClean()) << "only errors make a manager unclean";
  man.msgError("e");
  EXPECT_FALSE(man.getClean());
  EXPECT_FALSE(man.getAbortFlag());
  man.msgInternal("x");
  man.msgFatal("f");
  EXPECT_TRUE(man.getAbortFlag());
  man.msgUserFatalByNum(3, "u");
  EXPECT_EQ(Counts(man), "1 1 2 1 1 1 1 1");

  man.resetWarnCount();
  man.resetFatalCount();
  EXPECT_EQ(Counts(man), "1 1 0 1 1 0 1 1");
  man.setClean(true);
  man.setAbortFlag(false);
  EXPECT_TRUE(man.getClean());
  EXPECT_FALSE(man.getAbortFlag());

  man.msgMessage(static_cast<Port_MsgMan::MsgType>(-1), "out of range");
  EXPECT_EQ(man.records().size(), 10u);
  EXPECT_EQ(Counts(man), "1 1 0 1 1 0 1 1");
}

TEST(MessageCounts, TurnedOffNumbersAreDroppedUntilTurnedOn) {
  Port_MsgCollector man;
  man.turnOffMsg(17);
  man.turnOffMsg(0);
  EXPECT_FALSE(man.isMsgOn(17));
  EXPECT_TRUE(man.isMsgOn(0));

  man.msgErrorByNum(17, "silenced %d", 1);
  man.printMsg(Port_MsgMan::kWarning, 17, "silenced too");
  man.msgErrorByNum(18, "other number");
  man.msgError("unnumbered");
  EXPECT_EQ(man.getErrCount(), 2);
  EXPECT_EQ(man.getWarnCount(), 0);
  EXPECT_FALSE(man.getClean());

  man.turnOnMsg(17);
  man.msgErrorByNum(17, "heard");
  ASSERT_EQ(man.records().size(), 3u);
  EXPECT_EQ(man.records()[0].number, 18);
  EXPECT_EQ(man.records()[2].text, "heard");
}

TEST_F(MessageTest, DebugTextsAreCapturedAndNeverReachManagers) {
  Port_MsgCollector man;
  Port_MsgDispatcher::addMsgMan(&man);
  {
    Port_DebugCapture outer;
    Port_MsgManData::debugStub("Error: CHdlProject::createNewFile - %s\n", "no file");
    {
      Port_DebugCapture inner;
      Port_MsgManData::debugStub("inner");
      EXPECT_EQ(inner.text(), "inner");
    }
    Port_MsgManData::debugStub(" after");
    EXPECT_EQ(outer.text(), "Error: CHdlProject::createNewFile - no file\n after");
  }
  EXPECT_TRUE(man.records().empty());
}

TEST(MessageDebug, EchoToStandardErrorFollowsTheEnvironment) {
  std::optional<std::string> saved;
  if (const char* value = std::getenv("QUILLON_DEBUG")) saved = value;
  Port_DebugCapture keepSinkQuiet;

  setenv("QUILLON_DEBUG", "1", 1);
  testing::internal::CaptureStderr();
  Port_MsgManData::debugStub("shown %d\n", 1);
  std::string shown = testing::internal::GetCapturedStderr();
  unsetenv("QUILLON_DEBUG");
  testing::internal::CaptureStderr();
  Port_MsgManData::debugStub("hidden\n");
  std::string hidden = testing::internal::GetCapturedStderr();
  if (saved) setenv("QUILLON_DEBUG", saved->c_str(), 1);

  EXPECT_EQ(shown, "shown 1\n");
  EXPECT_EQ(hidden, "");
  EXPECT_EQ(keepSinkQuiet.text(), "shown 1\nhidden\n");
}

TEST_F(MessageTest, NullFormatDeliversNothingAndSaysSoOnTheDebugChannel) {
  Port_MsgCollector man;
  Port_MsgDispatcher::addMsgMan(&man);
  Port_DebugCapture debug;
  const char* noFormat = nullptr;
  ElaboratorSource()->issueError(noFormat);
  man.msgWarning(noFormat);
  EXPECT_TRUE(man.records().empty());
  EXPECT_NE(debug.text().find("../src/CElaborator:42"), std::string::npos);
  EXPECT_NE(debug.text().find("without a format"), std::string::npos);
}

TEST_F(MessageTest, VeryLongTextArrivesIntact) {
  LineRecorder recorder;
  Port_MsgCollector collector;
  Port_MsgDispatcher::addMsgMan(&recorder);
  Port_MsgDispatcher::addMsgMan(&collector);
  std::string longLine(100 * 1024, 'v');
  longLine[5000] = 'X';

  ElaboratorSource()->issueInfo("%s|%s", longLine.c_str(), "end");

  ASSERT_EQ(collector.records().size(), 1u);
  EXPECT_EQ(collector.records()[0].text, longLine + "|end");
  ASSERT_EQ(recorder.written.size(), 1u);
  ASSERT_EQ(recorder.written[0].lines.size(), 1u);
  EXPECT_EQ(recorder.written[0].lines[0].size(), longLine.size() + 4);
  EXPECT_EQ(recorder.written[0].lines[0][5000], L'X');
  EXPECT_EQ(recorder.written[0].lines[0].substr(longLine.size()), L"|end");
}

}  // namespace
