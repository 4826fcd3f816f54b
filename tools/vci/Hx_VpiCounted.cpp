#include "vci/Hx_VpiCounted.h"

#include "Port/SafeCount.h"

Hx_VpiCounted::Hx_VpiCounted() { Port::NoteObjectCreated(); }

Hx_VpiCounted::~Hx_VpiCounted() { Port::NoteObjectDestroyed(); }

std::int32_t Hx_VpiCounted::RefCount() const { return __atomic_load_n(&refs_, __ATOMIC_ACQUIRE); }

void Hx_VpiCounted::AddRef() noexcept { Port::SafeIncr(&refs_); }

void Hx_VpiCounted::Release() noexcept {
  if (Port::SafeDecr(&refs_) == 0) {
    delete this;
  }
}
