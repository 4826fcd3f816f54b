#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "Port/SafeCount.h"
#include "vci/Hx_Vci.h"

TEST(VpiHandles, CopiesMovesAndResetsCountReferences) {
  const long liveBefore = Port::LiveObjectCount();
  Hx_VpiHandlePtr first = Hx_VpiHandlePtr::Make(vpiModule);
  EXPECT_EQ(first.UseCount(), 1);
  EXPECT_EQ(Port::LiveObjectCount(), liveBefore + 1);

  Hx_VpiHandlePtr copy = first;
  EXPECT_EQ(first.UseCount(), 2);
  Hx_VpiHandlePtr moved = std::move(copy);
  EXPECT_FALSE(copy);
  EXPECT_EQ(copy.UseCount(), 0);
  EXPECT_EQ(moved.UseCount(), 2);
  EXPECT_TRUE(moved == first);

  Hx_VpiHandlePtr& alias = moved;
  moved = alias;
  EXPECT_EQ(first.UseCount(), 2);

  Hx_VpiHandlePtr rewrapped(first.get());
  EXPECT_EQ(first.UseCount(), 3);
  rewrapped.reset();
  moved.reset();
  EXPECT_EQ(first.UseCount(), 1);

  first = Hx_VpiHandlePtr::Make(vpiPort);
  EXPECT_EQ(Port::LiveObjectCount(), liveBefore + 1) << "replacing the last reference frees the object";
  EXPECT_EQ(first->GetType(), vpiPort);
  first = nullptr;
  EXPECT_EQ(Port::LiveObjectCount(), liveBefore);
}

TEST(VpiHandles, ObjectsLiveWhileAnyHandleOrContainerHoldsThem) {
  const long liveBefore = Port::LiveObjectCount();
  Hx_VpiHandlePtr net = Hx_VpiHandlePtr::Make(vpiLowConn);
  {
    Hx_VpiHandlePtr port = Hx_VpiHandlePtr::Make(vpiPort);
    port->SetRelated(vpiLowConn, net);
    EXPECT_EQ(net.UseCount(), 2);
    Hx_VpiIteratorPtr iterator = Hx_VpiIteratorPtr::Make(std::vector<Hx_VpiHandlePtr>{port});
    port.reset();
    EXPECT_EQ(Port::LiveObjectCount(), liveBefore + 3) << "the iterator keeps the port";
  }
  EXPECT_EQ(net.UseCount(), 1);
  EXPECT_EQ(Port::LiveObjectCount(), liveBefore + 1);
}

TEST(VpiAccess, AnswersTheQueriesOfAModuleWalk) {
  Hx_VpiHandlePtr design = Hx_VpiHandlePtr::Make(0);
  Hx_VpiHandlePtr top = Hx_VpiHandlePtr::Make(vpiModule);
  top->SetStr(vpiName, "top");
  top->SetInt(vpiLineNo, 3);
  Hx_VpiHandlePtr port = Hx_VpiHandlePtr::Make(vpiPort);
  Hx_VpiHandlePtr net = Hx_VpiHandlePtr::Make(vpiLowConn);
  net->SetStr(vpiName, "clk");
  port->SetRelated(vpiLowConn, net);
  top->AddChild(port);
  Hx_VpiHandlePtr instance = Hx_VpiHandlePtr::Make(vpiModule);
  instance->SetStr(vpiName, "u1");
  instance->SetStr(vpiDefName, "sub");
  top->AddChild(instance);
  Hx_VpiHandlePtr sub = Hx_VpiHandlePtr::Make(vpiModule);
  design->AddChild(top);
  design->AddChild(sub);
  Hx_VpiAccess access(design);

  Hx_VpiIteratorPtr modules = access.iterate(vpiModule, nullptr);
  EXPECT_EQ(access.scan(modules), top);
  EXPECT_EQ(access.scan(modules), sub);
  EXPECT_FALSE(access.scan(modules));
  EXPECT_FALSE(access.scan(modules));

  EXPECT_EQ(access.get(vpiLineNo, top), 3);
  EXPECT_EQ(access.get(vpiLineNo, sub), vpiUndefined);
  EXPECT_EQ(access.get_str(vpiName, access.handle(vpiLowConn, access.scan(access.iterate(vpiPort, top)))),
            "clk");
  Hx_VpiIteratorPtr instances = access.iterate(vpiModule, top);
  Hx_VpiHandlePtr found = access.scan(instances);
  EXPECT_EQ(access.get_str(vpiDefName, found), "sub");
  EXPECT_EQ(access.get_str(vpiName, found), "u1");
  EXPECT_FALSE(access.scan(instances));

  EXPECT_FALSE(access.iterate(vpiPort, sub)) << "nothing to iterate gives no iterator";
  EXPECT_FALSE(access.scan(nullptr));
  EXPECT_FALSE(access.handle(vpiLowConn, nullptr));
  EXPECT_EQ(access.get(vpiLineNo, nullptr), vpiUndefined);
  EXPECT_EQ(access.get_str(vpiName, nullptr), "");
  EXPECT_FALSE(Hx_VpiAccess(nullptr).iterate(vpiModule, nullptr));
}

TEST(VpiObject, PropertiesPastTheFirstFewAreKeptReplacedAndRemoved) {
  Hx_VpiHandlePtr object = Hx_VpiHandlePtr::Make(vpiModule);
  for (int property = 1; property <= 5; ++property) {
    object->SetInt(property, property * 10);
    object->SetStr(property, "text " + std::to_string(property));
  }
  object->SetInt(1, -1);
  object->SetStr(4, "replaced");
  EXPECT_EQ(object->GetInt(1), -1);
  EXPECT_EQ(object->GetInt(5), 50);
  EXPECT_EQ(object->GetInt(6), vpiUndefined);
  EXPECT_EQ(object->GetStr(1), "text 1");
  EXPECT_EQ(object->GetStr(4), "replaced");
  EXPECT_EQ(object->GetStr(5), "text 5");

  constexpr int kHighConnection = 79;
  Hx_VpiHandlePtr first = Hx_VpiHandlePtr::Make(vpiNet);
  Hx_VpiHandlePtr second = Hx_VpiHandlePtr::Make(vpiNet);
  Hx_VpiHandlePtr third = Hx_VpiHandlePtr::Make(vpiNet);
  object->SetRelated(vpiLowConn, first);
  object->SetRelated(kHighConnection, second);
  object->SetRelated(vpiLowConn, third);
  EXPECT_EQ(first.UseCount(), 1) << "a replaced relation lets go of its object";
  EXPECT_EQ(object->GetRelated(vpiLowConn), third);
  object->SetRelated(vpiLowConn, nullptr);
  EXPECT_FALSE(object->GetRelated(vpiLowConn));
  EXPECT_EQ(object->GetRelated(kHighConnection), second);
  EXPECT_EQ(third.UseCount(), 1);
  object->SetRelated(kHighConnection, nullptr);
  EXPECT_FALSE(object->GetRelated(kHighConnection));
  EXPECT_EQ(second.UseCount(), 1);
}
