// Records the largest single allocation made through operator new while a probe runs, so that a
// test can show that corrupted input never makes the code ask for a huge block of memory.
#pragma once

#include <cstddef>

namespace AllocationProbe {

void Start();
// The largest size requested since Start.
std::size_t Stop();

}  // namespace AllocationProbe
