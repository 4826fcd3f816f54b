// Replaces the non-array forms of operator new and delete in this test program. The array and
// aligned forms are left to the runtime: they allocate and free among themselves, so every block
// is still freed by the family that allocated it (which the address sanitizer checks).
#include "AllocationProbe.h"

#include <atomic>
#include <cstdlib>
#include <new>

namespace {

std::atomic<bool> recording{false};
std::atomic<std::size_t> largest{0};

void Note(std::size_t size) {
  if (!recording.load(std::memory_order_relaxed)) return;
  std::size_t seen = largest.load(std::memory_order_relaxed);
  while (size > seen && !largest.compare_exchange_weak(seen, size)) {
  }
}

void* Allocate(std::size_t size) {
  Note(size);
  return std::malloc(size == 0 ? 1 : size);
}

}  // namespace

namespace AllocationProbe {

void Start() {
  largest = 0;
  recording = true;
}

std::size_t Stop() {
  recording = false;
  return largest;
}

}  // namespace AllocationProbe

void* operator new(std::size_t size) {
  if (void* block = Allocate(size)) return block;
  throw std::bad_alloc();
}
void* operator new(std::size_t size, const std::nothrow_t&) noexcept { return Allocate(size); }
void operator delete(void* block) noexcept { std::free(block); }
void operator delete(void* block, std::size_t) noexcept { std::free(block); }
void operator delete(void* block, const std::nothrow_t&) noexcept { std::free(block); }
