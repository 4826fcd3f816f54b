// Heap blocks shared with the host libraries: a block from any of these functions may be grown or
// released by the others, whichever library made it.
#pragma once

#include <cstddef>

// A block of at least `size` bytes, or null when memory is exhausted. A size of 0 still gives a
// distinct block that must be released.
void* cvn_malloc(std::size_t size);

// Resizes `block` (null acts as cvn_malloc), keeping its content up to the smaller size. Null when
// memory is exhausted, in which case `block` stays valid and unchanged. A size of 0 keeps a
// distinct block rather than freeing it.
void* cvn_realloc(void* block, std::size_t size);

// Releases a block; null is ignored.
void cvn_free(void* block);
