// main() of every test program: after each test, no counted object may be left alive, so that
// leaks and double releases show up in the test that caused them.
#include <gtest/gtest.h>

#include "Port/SafeCount.h"

namespace {

class LiveObjectCheck : public testing::EmptyTestEventListener {
  void OnTestStart(const testing::TestInfo&) override { before_ = Port::LiveObjectCount(); }
  void OnTestEnd(const testing::TestInfo& info) override {
    long after = Port::LiveObjectCount();
    if (after != before_) {
      ADD_FAILURE() << info.test_suite_name() << "." << info.name() << " left " << (after - before_)
                    << " counted object(s) alive";
    }
  }
  long before_ = 0;
};

class NoObjectsLeft : public testing::Environment {
  void TearDown() override { EXPECT_EQ(Port::LiveObjectCount(), 0) << "counted objects still alive"; }
};

}  // namespace

int main(int argc, char** argv) {
  testing::InitGoogleTest(&argc, argv);
  testing::UnitTest::GetInstance()->listeners().Append(new LiveObjectCheck);
  testing::AddGlobalTestEnvironment(new NoObjectsLeft);
  return RUN_ALL_TESTS();
}
