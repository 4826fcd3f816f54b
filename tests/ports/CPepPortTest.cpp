// The port wrappers and their iterator, over port records made by hand.
#include <gtest/gtest.h>

#include <climits>
#include <memory>
#include <string>
#include <vector>

#include "CPepPort.h"
#include "CPepPortIter.h"
#include "IHdlPort.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/RefCounting.h"
#include "pep/PepPort.h"

namespace {

PepPort Record(std::string name, int direction, int left, int right, bool hasRange = true) {
  return PepPort{std::move(name), "logic", direction, left, right, hasRange};
}

// An iterator over wrappers of `records`, which must outlive it.
Prjrep::AutoRelease<Vad::IHdlPortIterator> IteratorOver(const std::vector<PepPort>& records) {
  auto request = std::make_shared<Vad::CPepPortRequest>();
  std::uint32_t position = 0;
  for (const PepPort& record : records)
    request->ports.push_back(std::make_unique<Vad::CPepPort>(&record, nullptr, ++position));
  return Vad::CPepPortIter::New(std::move(request));
}

std::vector<Vad::IHdlPort*> PortsOf(Vad::IHdlPortIterator* iterator) {
  std::vector<Vad::IHdlPort*> ports;
  for (iterator->First(); !iterator->IsDone(); iterator->Next()) ports.push_back(iterator->Current());
  return ports;
}

std::string NameOf(Vad::IHdlPort* port) {
  Port::StringBase name;
  EXPECT_EQ(port->getName(&name), CitI::kOk);
  return name.str();
}

TEST(PepPortIter, ListsThePortsInRecordOrderNumberedFromOneWithDirectionsBeyondInAndOutAsThirteen) {
  const std::vector<PepPort> records{
      Record("clk", PepPort::kDirectionIn, 0, 0, false), Record("data", PepPort::kDirectionOut, 7, 0),
      Record("bus", PepPort::kDirectionInOut, 0, 0, false), Record("odd", 42, 0, 0)};
  auto iterator = IteratorOver(records);
  std::vector<Vad::IHdlPort*> ports = PortsOf(iterator.Get());
  ASSERT_EQ(ports.size(), 4u);
  const std::int32_t directions[] = {0, 1, 13, 13};
  for (std::uint32_t i = 0; i < 4; ++i) {
    EXPECT_EQ(ports[i]->getPosition(), i + 1);
    EXPECT_EQ(NameOf(ports[i]), records[i].name);
    EXPECT_EQ(ports[i]->getDirection(), directions[i]);
  }
  Port::StringBase type;
  EXPECT_EQ(ports[1]->getTypeName(&type), CitI::kOk);
  EXPECT_EQ(type.str(), "logic");
}

TEST(PepPortIter, BoundsInEitherOrderGiveTheSameSpanLowAndHigh) {
  const std::vector<PepPort> records{Record("down", PepPort::kDirectionIn, 7, 0),
                                     Record("up", PepPort::kDirectionIn, 0, 7),
                                     Record("negative", PepPort::kDirectionIn, -2, 5),
                                     Record("widest", PepPort::kDirectionIn, INT_MAX, INT_MIN),
                                     Record("none", PepPort::kDirectionIn, 0, 0, false)};
  auto iterator = IteratorOver(records);
  std::vector<Vad::IHdlPort*> ports = PortsOf(iterator.Get());
  ASSERT_EQ(ports.size(), 5u);
  for (Vad::IHdlPort* port : {ports[0], ports[1]}) {
    EXPECT_EQ(port->getRangeSpan(), 7) << NameOf(port);
    EXPECT_EQ(port->getRangeLow(), 0) << NameOf(port);
    EXPECT_EQ(port->getRangeHigh(), 7) << NameOf(port);
    EXPECT_TRUE(port->hasRange());
  }
  EXPECT_EQ(ports[2]->getRangeSpan(), 7);
  EXPECT_EQ(ports[2]->getRangeLow(), -2);
  // A distance beyond 32 bits is reported as the largest one.
  EXPECT_EQ(ports[3]->getRangeSpan(), INT_MAX);
  EXPECT_EQ(ports[3]->getRangeLow(), INT_MIN);
  EXPECT_FALSE(ports[4]->hasRange());
  EXPECT_EQ(ports[4]->getRangeSpan(), 0);
}

TEST(PepPortIter, StaysFinishedUntilFirstStartsAgain) {
  const std::vector<PepPort> records{Record("only", PepPort::kDirectionIn, 0, 0)};
  auto iterator = IteratorOver(records);
  EXPECT_FALSE(iterator->IsDone());
  EXPECT_EQ(iterator->Next(), CitI::kOk);
  EXPECT_TRUE(iterator->IsDone());
  EXPECT_EQ(iterator->Next(), CitI::kOk);
  EXPECT_TRUE(iterator->IsDone());
  EXPECT_EQ(iterator->Current(), nullptr);
  EXPECT_EQ(iterator->First(), CitI::kOk);
  ASSERT_NE(iterator->Current(), nullptr);
  EXPECT_EQ(NameOf(iterator->Current()), "only");

  auto empty = IteratorOver({});
  EXPECT_TRUE(empty->IsDone());
  EXPECT_EQ(empty->Current(), nullptr);
}

TEST(PepPortIter, AnswersItsInterfacesAndThePortsTheirsWithoutACountOfTheirOwn) {
  const std::vector<PepPort> records{Record("p", PepPort::kDirectionIn, 0, 0)};
  auto iterator = IteratorOver(records);
  Vad::IHdlPort* port = iterator->Current();
  for (const Port::XUID& id : {Vad::IHdlPortIterator::Iid(), CitI::IInterface::Iid()})
    EXPECT_EQ(iterator->QueryInterface(id), iterator.Get());
  for (const Port::XUID& id : {Vad::IHdlPort::Iid(), CitI::IInterface::Iid()})
    EXPECT_EQ(port->QueryInterface(id), port);
  EXPECT_NE(iterator->QueryInterface(Prjrep::IRefCount::Iid()), nullptr);
  EXPECT_EQ(iterator->QueryInterface(Vad::IHdlPort::Iid()), nullptr);
  // The ports live by the iterator's count, not by one of their own.
  EXPECT_EQ(port->QueryInterface(Prjrep::IRefCount::Iid()), nullptr);
  EXPECT_EQ(port->QueryInterface(Vad::IHdlPortIterator::Iid()), nullptr);
  EXPECT_EQ(port->getName(nullptr), CitI::kInvalidArg);
  EXPECT_EQ(port->getTypeName(nullptr), CitI::kInvalidArg);
}

TEST(PepPortIter, ThePortsLiveAsLongAsAnyReferenceToTheIterator) {
  const std::vector<PepPort> records{Record("kept", PepPort::kDirectionOut, 3, 0)};
  Prjrep::AutoPtr<Vad::IHdlPortIterator> second;
  {
    auto first = IteratorOver(records);
    second = first.Get();
    EXPECT_EQ(Prjrep::RefCountOf(second.Get()), 2u);
  }
  EXPECT_EQ(Prjrep::RefCountOf(second.Get()), 1u);
  ASSERT_NE(second->Current(), nullptr);
  EXPECT_EQ(NameOf(second->Current()), "kept");
  EXPECT_EQ(second->Current()->getRangeHigh(), 3);
}

}  // namespace
