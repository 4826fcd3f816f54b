// Turning an interface pointer handed back to the module into the module's own object.
#pragma once

#include "CitI.h"
#include "Identifiers.h"

namespace Prjrep {

// For classes whose IInterface face is the object itself. A foreign object, or one of another
// class, yields null.
template <class T>
T* ObjectCast(CitI::IInterface* object) {
  return object ? dynamic_cast<T*>(object->QueryInterface(CitI::IInterface::Iid())) : nullptr;
}

// For classes that answer the implementation identity with themselves (design objects, library
// references, property iterators). A foreign object answers null.
template <class T>
T* ImplementationCast(CitI::IInterface* object) {
  if (!object) return nullptr;
  return dynamic_cast<T*>(object->QueryInterface(Vad::InterfaceIds::ImplementationIdentity()));
}

}  // namespace Prjrep
