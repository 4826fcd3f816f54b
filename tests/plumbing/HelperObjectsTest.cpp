#include <gtest/gtest.h>

#include "CEventSenderHelper.h"
#include "CTimestampHelper.h"
#include "PlumbingFixtures.h"

using namespace plumbing_test;

TEST(EventSender, RemovingDuringSendEmptiesTheEntryAndDestructionDetachesTheRest) {
  Receiver first, second, third;
  {
    Prjrep::CEventSenderHelper sender(nullptr);
    EXPECT_EQ(sender.AddReceiver(&first), CitI::kOk);
    EXPECT_EQ(sender.AddReceiver(&second), CitI::kOk);
    EXPECT_EQ(sender.AddReceiver(&third), CitI::kOk);
    EXPECT_EQ(sender.AddReceiver(&first), CitI::kOk);  // listed once
    EXPECT_EQ(first.attaches, 1);
    EXPECT_EQ(sender.AddReceiver(nullptr), CitI::kFail);

    first.onEvent = [&] { sender.RemoveReceiver(&second); };
    Receiver event;
    EXPECT_TRUE(sender.SendEvent(&event));
    EXPECT_EQ(first.events, 1);
    EXPECT_EQ(second.events, 0);
    EXPECT_EQ(third.events, 1);
    EXPECT_EQ(second.detaches, 1);
    EXPECT_FALSE(sender.SendEvent(nullptr));
    EXPECT_EQ(third.events, 1);

    EXPECT_EQ(sender.EntryCount(), 3u);
    sender.Compact();
    EXPECT_EQ(sender.EntryCount(), 2u);
    EXPECT_EQ(sender.RemoveReceiver(&second), CitI::kOk);  // not listed: still 1
    EXPECT_EQ(second.detaches, 1);

    // A new receiver reuses an empty entry.
    sender.RemoveReceiver(&first);
    sender.AddReceiver(&second);
    EXPECT_EQ(sender.EntryCount(), 2u);
  }
  // The destroyed sender detaches the receivers it still lists, once each.
  EXPECT_EQ(first.detaches, 1);
  EXPECT_EQ(second.detaches, 2);
  EXPECT_EQ(third.detaches, 1);
}

TEST(Timestamp, OrdersBySecondsThenMicroseconds) {
  Prjrep::CTimestampHelper early(nullptr), late(nullptr);
  early.SetTime(100, 5);
  late.SetTime(100, 6);
  std::int32_t order = 0;
  EXPECT_EQ(early.Compare(&late, &order), CitI::kOk);
  EXPECT_EQ(order, -1);
  EXPECT_EQ(late.Compare(&early, &order), CitI::kOk);
  EXPECT_EQ(order, 1);
  bool answer = true;
  late.SetTime(99, 1000005);  // normalised to 100 s 5 us
  EXPECT_EQ(late.Compare(&early, &order), CitI::kOk);
  EXPECT_EQ(order, 0);
  EXPECT_EQ(late.IsNewerThan(&early, &answer), CitI::kOk);
  EXPECT_FALSE(answer);
  EXPECT_EQ(early.IsNewerThan(&late, &answer), CitI::kOk);
  EXPECT_FALSE(answer);
  EXPECT_EQ(early.IsOlderThan(&late, &answer), CitI::kOk);
  EXPECT_FALSE(answer);
  late.SetTime(-1, -1);  // negative microseconds borrow from the seconds
  std::int64_t s = 0, us = 0;
  late.GetTime(&s, &us);
  EXPECT_EQ(s, -2);
  EXPECT_EQ(us, 999999);
  EXPECT_EQ(late.IsOlderThan(&early, &answer), CitI::kOk);
  EXPECT_TRUE(answer);
}

TEST(Timestamp, NullOutParametersAreRefusedAndTextHasNoLineFeed) {
  Prjrep::CTimestampHelper stamp(nullptr);
  std::int64_t s = 0;
  EXPECT_EQ(stamp.GetTime(&s, nullptr), CitI::kInvalidArg);
  EXPECT_EQ(stamp.GetTime(nullptr, &s), CitI::kInvalidArg);
  EXPECT_EQ(stamp.SetToNow(), CitI::kOk);
  std::int64_t us = 0;
  stamp.GetTime(&s, &us);
  EXPECT_GT(s, 1'600'000'000);
  Port::StringBase text;
  EXPECT_EQ(stamp.GetText(&text), CitI::kOk);
  EXPECT_FALSE(text.IsEmpty());
  EXPECT_FALSE(text.EndsWith("\n"));
  EXPECT_EQ(stamp.Compare(nullptr, nullptr), CitI::kInvalidArg);
}
