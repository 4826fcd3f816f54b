#include <gtest/gtest.h>

#include <vector>

#include "DerivedOutput.h"
#include "MsgCapture.h"
#include "Port/MsgCollector.h"
#include "Port/MsgDispatcher.h"
#include "Port/MsgManData.h"
#include "TestHost.h"

namespace {

void Issue(Port_MsgMan::MsgType type, const char* text) {
  Port_MsgRecord record;
  record.type = type;
  record.text = text;
  record.category = "ProjectMgmt";
  Port_MsgDispatcher::dispatch(record);
}

}  // namespace

TEST(MsgCapture, GathersErrorsWarningsAndInformationOnlyAndSilencesTheOthers) {
  test_host::CollectedMessages collected;
  Port::StringBase captured;
  {
    Vad::MsgCapture capture;
    Issue(Port_MsgMan::kError, "e1");
    Issue(Port_MsgMan::kWarning, "w2\nw3");
    Issue(Port_MsgMan::kInfo, "i4");
    Issue(Port_MsgMan::kStatus, "s5");
    captured = capture.CapturedText();
  }
  EXPECT_EQ(captured, "e1w2w3i4");
  EXPECT_TRUE(collected.records().empty());

  // After the capture the managers hear messages again.
  Port_MsgManData::createObject("ProjectMgmt", "../src/Test", 1, "")->issueInfo("after");
  ASSERT_EQ(collected.records().size(), 1u);
  EXPECT_EQ(collected.records()[0].text, "after");
}

TEST(MsgCapture, RestoresEveryManagerInItsEarlierStateAndEnablesTheDefault) {
  Port_MsgCollector enabled, disabled;
  Port_MsgDispatcher::addMsgMan(&enabled);
  Port_MsgDispatcher::addMsgMan(&disabled);
  disabled.disable();
  Port_MsgManDefault* standard = Port_MsgDispatcher::getDefaultMsgMan();
  standard->disable();
  {
    Vad::MsgCapture capture;
    EXPECT_FALSE(Port_MsgDispatcher::isRegistered(&enabled));
    EXPECT_FALSE(Port_MsgDispatcher::isRegistered(standard));
    EXPECT_TRUE(Port_MsgDispatcher::isRegistered(&capture));
  }
  EXPECT_TRUE(Port_MsgDispatcher::isRegistered(&enabled));
  EXPECT_TRUE(Port_MsgDispatcher::isRegistered(&disabled));
  EXPECT_TRUE(Port_MsgDispatcher::isRegistered(standard));
  EXPECT_TRUE(enabled.isEnabled());
  EXPECT_FALSE(disabled.isEnabled());
  EXPECT_TRUE(standard->isEnabled());
  Port_MsgDispatcher::removeMsgMan(&enabled);
  Port_MsgDispatcher::removeMsgMan(&disabled);
}

TEST(DerivedOutput, TakesTextUntilTheStopSignalAndNeverAfter) {
  Port::StringBase target;
  std::int32_t stop = 0;
  Vad::DerivedOutput output(&target, &stop);
  EXPECT_TRUE(output.output("a"));
  EXPECT_TRUE(output.output(nullptr));
  EXPECT_TRUE(output.output("b"));
  EXPECT_EQ(target, "ab");
  stop = 1;
  EXPECT_TRUE(output.output("c"));
  stop = 0;
  EXPECT_TRUE(output.output("d"));
  EXPECT_EQ(target, "ab");
}
