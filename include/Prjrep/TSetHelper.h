// The common part of the set helpers and the iterator they hand out.
#pragma once

#include <cstdint>

#include "CitI.h"
#include "IPersist.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/ISet.h"
#include "Prjrep/RefCounting.h"
#include "Prjrep/TRefCountHelper.h"

namespace Prjrep {

// A set interface plus the helper slots 7 to 11. Derived helpers supply the storage.
template <class SetI>
class TSetHelper : public SetI {
 public:
  using Element = typename SetI::ElementType;
  using Iterator = typename SetI::IteratorType;

  // The set interface answers with the set; anything else goes to the owner when one is set;
  // without an owner IInterface is the set itself.
  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    if (id == SetI::Iid()) return this;
    if (owner_) return owner_->QueryInterface(id);
    if (id == CitI::IInterface::Iid()) return this;
    return QueryOwnCounter(id);
  }

  // Slot 7: the object that answers the other queries (and so carries the references).
  virtual CitI::Result SetOwner(CitI::IInterface* owner) {
    owner_ = owner;
    return CitI::kOk;
  }
  // Slot 8: releases the element an iterator stands on and removes it.
  virtual CitI::Result EraseAt(Iterator* position) = 0;

  // Slot 9: a count, then that many object references; each object that answers the element
  // interface is added.
  virtual CitI::Result Load(IArchive* archive) {
    std::int32_t count = 0;
    CitI::Result result = archive->ReadInt(&count);
    if (result != CitI::kOk) return result;
    for (std::int32_t i = 0; i < count; ++i) {
      CitI::IInterface* object = nullptr;
      result = archive->ReadObjectRef(&object);
      if (result != CitI::kOk) return result;
      if (auto* element = QueryAs<Element>(object)) this->Add(element);
    }
    return CitI::kOk;
  }

  // Slot 10: the count, then every element's persistence facet as an object reference. Every
  // element is written even after a failure; the result is the first failure.
  virtual CitI::Result Save(IArchive* archive) {
    CitI::Result first = archive->WriteInt(static_cast<std::int32_t>(this->GetCount()));
    AutoRelease<Iterator> iterator;
    if (this->CreateIterator(iterator.Out()) != CitI::kOk || !iterator) return CitI::kFail;
    for (; !iterator->IsDone(); iterator->Next()) {
      CitI::Result result = archive->WriteObjectRef(QueryAs<IPersist>(iterator->Current()));
      if (first == CitI::kOk) first = result;
    }
    return first;
  }

  // Slot 11: the element an iterator stands on, or null at the end.
  virtual Element* ElementAt(Iterator* position) = 0;

 protected:
  TSetHelper() = default;
  TSetHelper(const TSetHelper&) = delete;
  TSetHelper& operator=(const TSetHelper&) = delete;

  // A stand-alone set answers the reference-count interfaces with its own counter.
  virtual CitI::IInterface* QueryOwnCounter(const Port::XUID&) { return nullptr; }

 private:
  CitI::IInterface* owner_ = nullptr;
};

// The iterator of the set helpers. It holds one reference on its set (for an embedded set, on
// the set's owner) and is counted itself, starting at 1.
template <class SetHelper>
class TIteratorHelper final : public SetHelper::Iterator {
 public:
  using Element = typename SetHelper::Element;
  using Position = typename SetHelper::Position;

  explicit TIteratorHelper(SetHelper* set)
      : set_(set), keepAlive_(QueryAs<CitI::IInterface>(set)), position_(set->Begin()) {}

  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    if (id == SetHelper::Iterator::Iid() || id == CitI::IInterface::Iid()) return this;
    if (id == IRefCount::Iid() || id == IRefCountV1::Iid()) return &refs_;
    return nullptr;
  }
  Element* Current() override { return set_->At(position_); }
  CitI::Result First() override {
    position_ = set_->Begin();
    return CitI::kOk;
  }
  CitI::Result Next() override {
    if (set_->AtEnd(position_)) return CitI::kFail;
    set_->Advance(position_);
    return CitI::kOk;
  }
  bool IsDone() override { return set_->AtEnd(position_); }

  bool Iterates(const SetHelper* set) const { return set_ == set; }
  Position& position() { return position_; }

 private:
  SetHelper* set_;
  AutoPtr<CitI::IInterface> keepAlive_;
  TRefCountHelper<> refs_{this};
  Position position_;
};

// Hands out a new iterator over `set` through its iterator face, carrying its one reference.
template <class SetHelper>
CitI::Result CreateSetIterator(SetHelper* set, typename SetHelper::Iterator** out) {
  if (!out) return CitI::kInvalidArg;
  *out = nullptr;
  auto* iterator = new TIteratorHelper<SetHelper>(set);
  *out = QueryAs<typename SetHelper::Iterator>(iterator);
  if (!*out) {
    delete iterator;
    return CitI::kFail;
  }
  return CitI::kOk;
}

// The set's own iterator behind an iterator interface pointer, or null for a foreign or
// finished one.
template <class SetHelper>
TIteratorHelper<SetHelper>* OwnIterator(const SetHelper* set, typename SetHelper::Iterator* iterator) {
  auto* own = dynamic_cast<TIteratorHelper<SetHelper>*>(iterator);
  if (!own || !own->Iterates(set) || set->AtEnd(own->position())) return nullptr;
  return own;
}

}  // namespace Prjrep
