// Atomic reference counts and the live-object count.
#pragma once

#include <cstdint>

namespace Port {

// Atomic increment and decrement of a signed 32-bit count; both return the new value.
std::int32_t SafeIncr(std::int32_t* count);
std::int32_t SafeDecr(std::int32_t* count);

// Counted objects report their construction and destruction here, so that tests can check that
// every object created was destroyed exactly once.
void NoteObjectCreated();
void NoteObjectDestroyed();
long LiveObjectCount();

}  // namespace Port
