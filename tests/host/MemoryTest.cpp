#include <gtest/gtest.h>

#include <cstring>

#include "Port/Memory.h"

TEST(Memory, ZeroSizedBlocksAreDistinctAndReallocKeepsContentAndNeverFreesOnZero) {
  void* first = cvn_malloc(0);
  void* second = cvn_malloc(0);
  ASSERT_NE(first, nullptr);
  ASSERT_NE(second, nullptr);
  EXPECT_NE(first, second);
  cvn_free(first);
  cvn_free(second);
  cvn_free(nullptr);

  auto* block = static_cast<char*>(cvn_realloc(nullptr, 16));
  ASSERT_NE(block, nullptr);
  std::memcpy(block, "0123456789abcdef", 16);
  block = static_cast<char*>(cvn_realloc(block, 1 << 20));
  ASSERT_NE(block, nullptr);
  EXPECT_EQ(std::memcmp(block, "0123456789abcdef", 16), 0);
  block = static_cast<char*>(cvn_realloc(block, 4));
  ASSERT_NE(block, nullptr);
  EXPECT_EQ(std::memcmp(block, "0123", 4), 0);
  // The block stays owned by the caller, who still frees it.
  block = static_cast<char*>(cvn_realloc(block, 0));
  ASSERT_NE(block, nullptr);
  cvn_free(block);
}
