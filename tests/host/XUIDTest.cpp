#include <gtest/gtest.h>

#include "CitI.h"
#include "Port/XUID.h"

TEST(XUID, TextAndWordsAgree) {
  Port::XUID fromText("{C569A982-87C5-4D45-8A2C-17B796723BDC}");
  EXPECT_EQ(fromText, CitI::IInterface::Iid());
  EXPECT_EQ(Port::XUID("{c569a982-87c5-4d45-8a2c-17b796723bdc}"), fromText);
  EXPECT_EQ(fromText.ToString(), "{C569A982-87C5-4D45-8A2C-17B796723BDC}");
}
