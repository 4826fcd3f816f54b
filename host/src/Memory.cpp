#include "Port/Memory.h"

#include <cstdlib>

namespace {
// The C library may answer a zero size with null; callers treat null as exhaustion.
std::size_t AtLeastOneByte(std::size_t size) { return size == 0 ? 1 : size; }
}  // namespace

void* cvn_malloc(std::size_t size) { return std::malloc(AtLeastOneByte(size)); }

void* cvn_realloc(void* block, std::size_t size) { return std::realloc(block, AtLeastOneByte(size)); }

void cvn_free(void* block) { std::free(block); }
