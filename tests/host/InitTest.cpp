#include <gtest/gtest.h>

#include "Port/Init.h"
#include "Port/InitObjects.h"

TEST(ServiceInit, EverySourceFileHoldsOneOfEach) {
  EXPECT_GE(Port::FileInit::Holders(), 1);
  EXPECT_GE(Port::PathListInit::Holders(), 1);
  EXPECT_GE(RavA::InstanceTableInit::Holders(), 1);
  EXPECT_GE(RavA::FactoryInit::Holders(), 1);
  EXPECT_GE(Port_MsgManInit::Holders(), 1);
}

TEST(ServiceInit, HoldersAreCountedUpAndDown) {
  const int files = Port::FileInit::Holders();
  const int factories = RavA::FactoryInit::Holders();
  {
    Port::FileInit extraFile;
    RavA::FactoryInit extraFactory;
    Port_MsgManInit extraMessages;
    EXPECT_EQ(Port::FileInit::Holders(), files + 1);
    EXPECT_EQ(RavA::FactoryInit::Holders(), factories + 1);
  }
  EXPECT_EQ(Port::FileInit::Holders(), files);
  EXPECT_EQ(RavA::FactoryInit::Holders(), factories);
}
