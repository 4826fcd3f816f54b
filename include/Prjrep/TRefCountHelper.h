// Reference counters kept in a helper object beside the counted object.
#pragma once

#include <cstdint>

#include "CitI.h"
#include "Port/SafeCount.h"

namespace Prjrep {

// The counter of every counted object except the factories. It starts at 1; when a release
// brings it to zero the owner is destroyed (which destroys this helper with it when the helper is
// a member of the owner). Queries for anything but the reference-count interfaces go to the
// owner.
template <class Owner = CitI::IInterface>
class TRefCountHelper final : public IRefCount {
 public:
  explicit TRefCountHelper(Owner* owner) : owner_(owner) { Port::NoteObjectCreated(); }
  ~TRefCountHelper() override { Port::NoteObjectDestroyed(); }
  TRefCountHelper(const TRefCountHelper&) = delete;
  TRefCountHelper& operator=(const TRefCountHelper&) = delete;

  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    if (id == IRefCountV1::Iid() || id == IRefCount::Iid()) return this;
    return owner_ ? owner_->QueryInterface(id) : nullptr;
  }
  CitI::Result AddRef() override {
    Port::SafeIncr(&count_);
    return CitI::kOk;
  }
  CitI::Result Release() override {
    if (Port::SafeDecr(&count_) == 0) {
      Owner* owner = owner_;
      owner_ = nullptr;
      delete owner;  // may destroy this helper; touch no member after it
    }
    return CitI::kOk;
  }
  std::uint32_t GetRefCount() override { return static_cast<std::uint32_t>(count_); }

 private:
  std::int32_t count_ = 1;
  Owner* owner_;
};

}  // namespace Prjrep

namespace CommonI {

// The reference-count face of the class factories. The count and the owner pointer are fields
// of the factory; the face deletes the owner when the count reaches zero.
template <class Owner>
class TRefCountHelper final : public IRefCount {
 public:
  TRefCountHelper(std::int32_t* count, Owner** owner) : count_(count), owner_(owner) {}

  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    if (id == IRefCount::Iid()) return this;
    return *owner_ ? (*owner_)->QueryInterface(id) : nullptr;
  }
  CitI::Result AddRef() override {
    Port::SafeIncr(count_);
    return CitI::kOk;
  }
  CitI::Result Release() override {
    if (Port::SafeDecr(count_) == 0 && *owner_) {
      Owner* owner = *owner_;
      *owner_ = nullptr;
      delete owner;  // destroys this face with it
    }
    return CitI::kOk;
  }
  CitI::Result GetRefCount(std::uint32_t* count) override {
    if (count) *count = static_cast<std::uint32_t>(*count_);
    return CitI::kOk;
  }

 private:
  std::int32_t* count_;
  Owner** owner_;
};

}  // namespace CommonI
