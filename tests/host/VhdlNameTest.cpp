#include <gtest/gtest.h>

#include <map>
#include <string>

#include "Host/VhdlName.h"

namespace {

TEST(VhdlName, BasicIdentifiersFoldExtendedOnesDoNotAndTheOrderAgrees) {
  EXPECT_TRUE(Host::SameVhdlName("Entity|My_Pkg", "entity|MY_PKG"));
  EXPECT_FALSE(Host::SameVhdlName("Entity|My_Pkg", "Entity|My_Pkg2"));
  EXPECT_TRUE(Host::SameVhdlName("Architecture|\\Top\\|RTL", "architecture|\\Top\\|rtl"));
  EXPECT_FALSE(Host::SameVhdlName("Architecture|\\Top\\|rtl", "Architecture|\\TOP\\|rtl"));
  // A doubled backslash stays inside the extended identifier; what follows it folds again.
  EXPECT_FALSE(Host::SameVhdlName("\\a\\\\b\\", "\\a\\\\B\\"));
  EXPECT_TRUE(Host::SameVhdlName("\\a\\\\b\\.X", "\\a\\\\b\\.x"));
  EXPECT_FALSE(Host::SameVhdlName("\\x\\", "x"));
  std::map<std::string, int, Host::VhdlNameLess> names;
  names["Sub"] = 1;
  names["SUB"] = 2;
  names["\\Sub\\"] = 3;
  names["\\SUB\\"] = 4;
  EXPECT_EQ(names.size(), 3u);
  EXPECT_EQ(names["sub"], 2);
  EXPECT_LT(Host::CompareVhdlNames("abc", "ABD"), 0);
  EXPECT_GT(Host::CompareVhdlNames("abcd", "ABC"), 0);
}

}  // namespace
