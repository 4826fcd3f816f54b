#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "SiblingPaths.h"

namespace {

TEST(SiblingPaths, PositionsAreExactFirstMatchesAndTextsFollowTheListOrder) {
  const std::vector<Port::StringBase> paths{"/p/a.v", "/p/B.v", "/p/b.v", "/p/a.v", ""};
  const Vad::SiblingPaths siblings{std::vector<Port::StringBase>(paths)};

  EXPECT_EQ(siblings.Paths(), paths);
  ASSERT_EQ(siblings.Texts().size(), paths.size());
  for (std::size_t i = 0; i < paths.size(); ++i) EXPECT_EQ(std::string(siblings.Texts()[i]), paths[i].str());

  EXPECT_EQ(siblings.CountBefore("/p/a.v"), 0u) << "a path listed twice stands where it is first";
  EXPECT_EQ(siblings.CountBefore("/p/b.v"), 2u) << "letter case counts";
  EXPECT_EQ(siblings.CountBefore(""), 4u);
  EXPECT_EQ(siblings.CountBefore("/p/c.v"), paths.size());
  EXPECT_EQ(siblings.CountBefore("/p/a.v/"), paths.size());

  const Vad::SiblingPaths none;
  EXPECT_EQ(none.CountBefore("/p/a.v"), 0u);
  EXPECT_TRUE(none.Texts().empty());
}

}  // namespace
