#include <gtest/gtest.h>

#include <set>

#include "CitI.h"
#include "Port/XUID.h"

TEST(XUID, TextAndWordsAgree) {
  Port::XUID fromText("{C569A982-87C5-4D45-8A2C-17B796723BDC}");
  EXPECT_EQ(fromText, CitI::IInterface::Iid());
  EXPECT_EQ(Port::XUID("{c569a982-87c5-4d45-8a2c-17b796723bdc}"), fromText);
  EXPECT_EQ(fromText.ToString(), "{C569A982-87C5-4D45-8A2C-17B796723BDC}");
}

TEST(XUID, MalformedTextIsRejected) {
  const char* malformed[] = {
      "",
      "C569A982-87C5-4D45-8A2C-17B796723BDC",     // no braces
      "{C569A982-87C5-4D45-8A2C-17B796723BD}",    // a digit short
      "{C569A982-87C5-4D45-8A2C-17B796723BDCC}",  // a digit over
      "{C569A98287-C5-4D45-8A2C-17B796723BDC}",   // dash out of place
      "{C569A982-87C5-4D45-8A2C-17B79672GBDC}",   // not hexadecimal
      "{C569A982-87C5-4D45-8A2C+17B796723BDC}",   // wrong separator
      "(C569A982-87C5-4D45-8A2C-17B796723BDC)",   // wrong brackets
  };
  const Port::XUID untouched(1, 2);
  for (const char* text : malformed) {
    Port::XUID out = untouched;
    EXPECT_FALSE(Port::XUID::Parse(text, out)) << text;
    EXPECT_EQ(out, untouched) << text;
    EXPECT_TRUE(Port::XUID(text).IsNull()) << text;
  }
}

TEST(XUID, NewIdentifiersAreUniqueAndRoundTrip) {
  std::set<Port::XUID> seen;
  for (int i = 0; i < 10000; ++i) {
    Port::XUID id = Port::XUID::New();
    EXPECT_FALSE(id.IsNull());
    EXPECT_TRUE(seen.insert(id).second) << "repeated " << id.ToString();
  }
  Port::XUID sample = *seen.begin();
  Port::XUID parsed;
  ASSERT_TRUE(Port::XUID::Parse(sample.ToString(), parsed));
  EXPECT_EQ(parsed, sample);
}
