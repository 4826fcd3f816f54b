// Sets keyed by text.
#pragma once

#include <map>
#include <utility>

#include "Port/StringBase.h"
#include "Prjrep/TSetHelper.h"

namespace Prjrep {

// An ordered map from text (byte order) to element, holding one reference on each element.
// Elements enter through Insert; Add is not provided. Iteration follows key order, and an
// iterator stays valid when elements are inserted or erased around it.
template <class SetI>
class TAssociativeSetHelper : public TSetHelper<SetI> {
 public:
  using Base = TSetHelper<SetI>;
  using Element = typename Base::Element;
  using Iterator = typename Base::Iterator;
  using Map = std::map<Port::StringBase, Element*>;
  struct Position {
    Port::StringBase key;
    bool atEnd = true;
  };

  TAssociativeSetHelper() = default;
  ~TAssociativeSetHelper() override { Clear(); }

  CitI::Result Add(Element*) override { return CitI::kNotImpl; }
  CitI::Result Remove(Iterator* position) override {
    auto* own = OwnIterator(this, position);
    if (!own) return CitI::kFail;
    Port::StringBase key = own->position().key;
    Advance(own->position());
    Erase(key);
    return CitI::kOk;
  }
  CitI::Result CreateIterator(Iterator** iterator) override { return CreateSetIterator(this, iterator); }
  std::uint32_t GetCount() override { return static_cast<std::uint32_t>(elements_.size()); }
  CitI::Result Clear() override {
    Map released;
    released.swap(elements_);
    for (auto& entry : released) ReleaseOf(entry.second);
    return CitI::kOk;
  }
  CitI::Result EraseAt(Iterator* position) override { return Remove(position); }
  Element* ElementAt(Iterator* position) override {
    auto* own = OwnIterator(this, position);
    return own ? At(own->position()) : nullptr;
  }

  // Slot 12: stores `element` under `key`; an element already stored there is replaced (the
  // new one gains a reference, the old one loses one).
  virtual CitI::Result Insert(const Port::StringBase& key, Element* element) {
    if (!element) return CitI::kFail;
    AddRefOf(element);
    auto [it, inserted] = elements_.try_emplace(key, element);
    if (!inserted) ReleaseOf(std::exchange(it->second, element));
    return CitI::kOk;
  }

  // Keys are persisted with the elements, since the elements do not carry them.
  CitI::Result Save(IArchive* archive) override {
    CitI::Result first = archive->WriteInt(static_cast<std::int32_t>(elements_.size()));
    for (auto& [key, element] : elements_) {
      CitI::Result result = archive->WriteString(key);
      if (result == CitI::kOk) result = archive->WriteObjectRef(QueryAs<IPersist>(element));
      if (first == CitI::kOk) first = result;
    }
    return first;
  }
  CitI::Result Load(IArchive* archive) override {
    std::int32_t count = 0;
    CitI::Result result = archive->ReadInt(&count);
    for (std::int32_t i = 0; result == CitI::kOk && i < count; ++i) {
      Port::StringBase key;
      CitI::IInterface* object = nullptr;
      result = archive->ReadString(&key);
      if (result == CitI::kOk) result = archive->ReadObjectRef(&object);
      if (auto* element = QueryAs<Element>(object); result == CitI::kOk && element) Insert(key, element);
    }
    return result;
  }

  Element* Find(const Port::StringBase& key) const {
    auto it = elements_.find(key);
    return it == elements_.end() ? nullptr : it->second;
  }
  bool Erase(const Port::StringBase& key) {
    auto it = elements_.find(key);
    if (it == elements_.end()) return false;
    Element* element = it->second;
    elements_.erase(it);
    ReleaseOf(element);
    return true;
  }
  const Map& Elements() const { return elements_; }

  // Positions, for the iterator helper. A position names a key; when that key is gone it moves
  // on to the next one.
  Position Begin() const {
    if (elements_.empty()) return {};
    return {elements_.begin()->first, false};
  }
  bool AtEnd(Position& position) const {
    Settle(position);
    return position.atEnd;
  }
  void Advance(Position& position) const {
    if (AtEnd(position)) return;
    auto next = elements_.upper_bound(position.key);
    position = next == elements_.end() ? Position{} : Position{next->first, false};
  }
  Element* At(Position& position) const {
    if (AtEnd(position)) return nullptr;
    return elements_.find(position.key)->second;
  }

 private:
  void Settle(Position& position) const {
    if (position.atEnd) return;
    auto it = elements_.lower_bound(position.key);
    if (it == elements_.end()) {
      position = {};
    } else if (it->first != position.key) {
      position.key = it->first;
    }
  }

  Map elements_;
};

}  // namespace Prjrep
