// Small counted classes for exercising the plumbing.
#pragma once

#include <functional>
#include <string>
#include <vector>

#include "CitI.h"
#include "IEventSender.h"
#include "Prjrep/ISet.h"
#include "Prjrep/TRefCountHelper.h"

namespace plumbing_test {

class IThing : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID("{0D0A1C6E-3F0B-4B8E-9E54-6A1F7E2B9C01}")
  virtual int Value() = 0;
};
class IThingIterator : public Prjrep::IIteratorOf<IThing> {
 public:
  QUILLON_INTERFACE_ID("{0D0A1C6E-3F0B-4B8E-9E54-6A1F7E2B9C02}")
};
class IThingSet : public Prjrep::ISetOf<IThing, IThingIterator> {
 public:
  QUILLON_INTERFACE_ID("{0D0A1C6E-3F0B-4B8E-9E54-6A1F7E2B9C03}")
};
// Differs from IThing's identifier in the low word only.
inline constexpr Port::XUID kNearThingId{0x0D0A1C6E3F0B4B8Eull, 0x9E546A1F7E2B9C00ull};

// A counted object whose destruction is recorded.
class Thing final : public IThing {
 public:
  Thing(int value, std::vector<int>* destroyed = nullptr) : value_(value), destroyed_(destroyed) {}
  ~Thing() override {
    if (destroyed_) destroyed_->push_back(value_);
  }
  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    if (id == IThing::Iid() || id == CitI::IInterface::Iid()) return this;
    if (id == Prjrep::IRefCount::Iid() || id == Prjrep::IRefCountV1::Iid()) return &refs_;
    return nullptr;
  }
  int Value() override { return value_; }

 private:
  int value_;
  std::vector<int>* destroyed_;
  Prjrep::TRefCountHelper<> refs_{this};
};

// Records what an event sender does to it.
class Receiver final : public Prjrep::IEventReceiver {
 public:
  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    return id == IEventReceiver::Iid() || id == CitI::IInterface::Iid() ? this : nullptr;
  }
  CitI::Result OnEvent(CitI::IInterface*) override {
    ++events;
    if (onEvent) onEvent();
    return CitI::kOk;
  }
  CitI::Result OnAttach(Prjrep::IEventSender*) override {
    ++attaches;
    return CitI::kOk;
  }
  CitI::Result OnDetach(Prjrep::IEventSender*) override {
    ++detaches;
    return CitI::kOk;
  }
  int events = 0, attaches = 0, detaches = 0;
  std::function<void()> onEvent;
};

}  // namespace plumbing_test
