// Numbers for generated inputs of tests and benchmarks: xorshift64*, the same sequence for a seed
// on every platform, unlike the standard distributions.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

class SeededRandom {
 public:
  explicit SeededRandom(std::uint64_t seed) : state_(seed ? seed : 1) {}

  std::uint64_t Next() {
    state_ ^= state_ >> 12;
    state_ ^= state_ << 25;
    state_ ^= state_ >> 27;
    return state_ * 0x2545F4914F6CDD1Dull;
  }
  // From 0 to `bound` - 1; `bound` must be positive.
  template <class Integer>
  Integer Below(Integer bound) {
    return static_cast<Integer>(Next() % static_cast<std::uint64_t>(bound));
  }
  bool Chance(int percent) { return Below(100) < percent; }

  // `count` bytes of every value.
  std::string Bytes(std::size_t count) {
    std::string bytes(count, '\0');
    for (char& byte : bytes) byte = static_cast<char>(Next() >> 56);
    return bytes;
  }

 private:
  std::uint64_t state_;
};
