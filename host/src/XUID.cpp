#include "Port/XUID.h"

#include <atomic>
#include <chrono>
#include <cstdio>
#include <random>

namespace Port {
namespace {

int HexValue(char c) {
  if (c >= '0' && c <= '9') return c - '0';
  if (c >= 'a' && c <= 'f') return c - 'a' + 10;
  if (c >= 'A' && c <= 'F') return c - 'A' + 10;
  return -1;
}

}  // namespace

XUID::XUID(std::string_view text) { Parse(text, *this); }

bool XUID::Parse(std::string_view text, XUID& out) {
  // {8-4-4-4-12}
  static constexpr std::size_t kDashes[] = {9, 14, 19, 24};
  if (text.size() != 38 || text.front() != '{' || text.back() != '}') return false;
  std::uint64_t words[2] = {0, 0};
  int digits = 0;
  for (std::size_t i = 1; i < 37; ++i) {
    bool dashHere = false;
    for (std::size_t d : kDashes) dashHere |= (i == d);
    if (dashHere) {
      if (text[i] != '-') return false;
      continue;
    }
    int value = HexValue(text[i]);
    if (value < 0) return false;
    std::uint64_t& word = words[digits / 16];
    word = (word << 4) | static_cast<std::uint64_t>(value);
    ++digits;
  }
  out = XUID(words[0], words[1]);
  return true;
}

XUID XUID::New() {
  static std::atomic<std::uint64_t> sequence{0};
  thread_local std::mt19937_64 engine{
      std::random_device{}() ^
      static_cast<std::uint64_t>(std::chrono::steady_clock::now().time_since_epoch().count())};
  // The sequence number guarantees uniqueness within the process; the random words make
  // collisions across processes unlikely.
  std::uint64_t high = engine();
  std::uint64_t low = engine() ^ (sequence.fetch_add(1) * 0x9E3779B97F4A7C15ull);
  // Version 4 / variant 1 bits, so the text reads as an ordinary random GUID.
  high = (high & ~0xF000ull) | 0x4000ull;
  low = (low & ~(0xC000000000000000ull)) | 0x8000000000000000ull;
  return XUID(high, low);
}

std::string XUID::ToString() const {
  char text[39];
  std::snprintf(text, sizeof text, "{%08X-%04X-%04X-%04X-%012llX}", static_cast<unsigned>(high_ >> 32),
                static_cast<unsigned>((high_ >> 16) & 0xFFFF), static_cast<unsigned>(high_ & 0xFFFF),
                static_cast<unsigned>(low_ >> 48), static_cast<unsigned long long>(low_ & 0xFFFFFFFFFFFFull));
  return text;
}

}  // namespace Port
