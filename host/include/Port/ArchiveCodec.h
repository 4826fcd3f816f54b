// The byte layer of the project archive: the header, the value tags and fixed-width little-endian
// integers. The decoder never reads past the end of its bytes; every Take reports whether the
// bytes were there.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

#include "Port/XUID.h"

namespace Port {

inline constexpr std::string_view kArchiveMagic{"\x89QLNARC\n", 8};
inline constexpr std::size_t kArchiveHeaderSize = kArchiveMagic.size() + 4;  // magic, version

// Every value starts with one of these tags. Each has an even number of set bits, so a single
// flipped bit never turns one valid tag into another.
enum class ArchiveTag : std::uint8_t {
  kInt32 = 0x03,
  kInt64 = 0x05,
  kBool = 0x06,
  kString = 0x09,
  kXUID = 0x0A,
  kObjectBegin = 0x0C,
  kObjectEnd = 0x0F,
  kNullRef = 0x11,
  kRef = 0x12,
};

// "an int", "a string", ... for messages; null for a byte that is no tag.
const char* ArchiveTagName(std::uint8_t tag);

class ArchiveEncoder {
 public:
  void PutTag(ArchiveTag tag) { PutByte(static_cast<std::uint8_t>(tag)); }
  void PutByte(std::uint8_t value) { bytes_.push_back(static_cast<char>(value)); }
  void PutUInt32(std::uint32_t value);
  void PutUInt64(std::uint64_t value);
  void PutXUID(const XUID& value);
  void PutBytes(std::string_view bytes) { bytes_.append(bytes); }

  const std::string& Bytes() const { return bytes_; }

 private:
  std::string bytes_;
};

class ArchiveDecoder {
 public:
  ArchiveDecoder() = default;
  explicit ArchiveDecoder(std::string_view bytes) : bytes_(bytes) {}

  std::size_t Position() const { return position_; }
  std::size_t Remaining() const { return bytes_.size() - position_; }

  bool TakeByte(std::uint8_t* value);
  bool TakeUInt32(std::uint32_t* value);
  bool TakeUInt64(std::uint64_t* value);
  bool TakeXUID(XUID* value);
  // A view of the next `count` bytes inside the decoder's bytes.
  bool TakeBytes(std::size_t count, std::string_view* bytes);

 private:
  bool TakeLittleEndian(std::size_t width, std::uint64_t* value);

  std::string_view bytes_;
  std::size_t position_ = 0;
};

}  // namespace Port
