// The one place where references are added and released.
#pragma once

#include <cstdint>

#include "CitI.h"

namespace Prjrep {

// Adds a reference through Prjrep::IRefCount, or CommonI::IRefCount when the first is not
// answered. False when the object answers neither (or is null).
inline bool AddRefOf(CitI::IInterface* object) {
  if (!object) return false;
  if (auto* count = static_cast<IRefCount*>(object->QueryInterface(IRefCount::Iid()))) {
    count->AddRef();
    return true;
  }
  if (auto* count = static_cast<CommonI::IRefCount*>(object->QueryInterface(CommonI::IRefCount::Iid()))) {
    count->AddRef();
    return true;
  }
  return false;
}

// Releases a reference the same way AddRefOf adds one.
inline bool ReleaseOf(CitI::IInterface* object) {
  if (!object) return false;
  if (auto* count = static_cast<IRefCount*>(object->QueryInterface(IRefCount::Iid()))) {
    count->Release();
    return true;
  }
  if (auto* count = static_cast<CommonI::IRefCount*>(object->QueryInterface(CommonI::IRefCount::Iid()))) {
    count->Release();
    return true;
  }
  return false;
}

// The current count, for diagnostics and tests; 0 for null or an uncounted object.
inline std::uint32_t RefCountOf(CitI::IInterface* object) {
  if (!object) return 0;
  if (auto* count = static_cast<IRefCount*>(object->QueryInterface(IRefCount::Iid())))
    return count->GetRefCount();
  std::uint32_t value = 0;
  if (auto* count = static_cast<CommonI::IRefCount*>(object->QueryInterface(CommonI::IRefCount::Iid())))
    count->GetRefCount(&value);
  return value;
}

}  // namespace Prjrep
