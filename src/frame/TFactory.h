// The class factory of one creatable class.
#pragma once

#include <cstdint>
#include <memory>
#include <new>

#include "Prjrep/RefCounting.h"
#include "Prjrep/TRefCountHelper.h"
#include "RavA/Factory.h"

namespace Port {

// Creates objects of `Class` when asked with exactly `ClassId()`. Counted through its
// CommonI::IRefCount face, which deletes the factory when the count reaches zero.
template <class Class, const Port::XUID& (*ClassId)()>
class TFactory final : public RavA::TFactory {
 public:
  TFactory() = default;
  TFactory(const TFactory&) = delete;
  TFactory& operator=(const TFactory&) = delete;

  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    if (id == CommonI::IRefCount::Iid()) return &refCountFace_;
    return RavA::TFactory::QueryInterface(id);
  }

  // The new object starts with the caller's one reference and is handed out as its IInterface.
  CitI::IInterface* CreateInstance(const Port::XUID& classId) override {
    if (classId != ClassId()) return nullptr;
    std::unique_ptr<Class> object(new (std::nothrow) Class());
    if (!object) return nullptr;
    CitI::IInterface* answer = object->QueryInterface(CitI::IInterface::Iid());
    if (answer) object.release();  // from here on its own count governs it
    return answer;
  }

 private:
  CommonI::TRefCountHelper<TFactory> refCountFace_{&count_, &owner_};
  std::int32_t count_ = 1;
  TFactory* owner_ = this;
};

}  // namespace Port
