#include "Port/SafeCount.h"

#include <atomic>

namespace Port {
namespace {
std::atomic<long> liveObjects{0};
}

std::int32_t SafeIncr(std::int32_t* count) { return __atomic_add_fetch(count, 1, __ATOMIC_ACQ_REL); }
std::int32_t SafeDecr(std::int32_t* count) { return __atomic_sub_fetch(count, 1, __ATOMIC_ACQ_REL); }

void NoteObjectCreated() { liveObjects.fetch_add(1, std::memory_order_relaxed); }
void NoteObjectDestroyed() { liveObjects.fetch_sub(1, std::memory_order_relaxed); }
long LiveObjectCount() { return liveObjects.load(std::memory_order_relaxed); }

}  // namespace Port
