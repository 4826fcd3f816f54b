#include "Port/ArchiveCodec.h"

namespace Port {

const char* ArchiveTagName(std::uint8_t tag) {
  switch (static_cast<ArchiveTag>(tag)) {
    case ArchiveTag::kInt32:
      return "an int";
    case ArchiveTag::kInt64:
      return "an int64";
    case ArchiveTag::kBool:
      return "a bool";
    case ArchiveTag::kString:
      return "a string";
    case ArchiveTag::kXUID:
      return "an identifier";
    case ArchiveTag::kObjectBegin:
      return "an object";
    case ArchiveTag::kObjectEnd:
      return "the end of an object";
    case ArchiveTag::kNullRef:
      return "a null reference";
    case ArchiveTag::kRef:
      return "an object reference";
  }
  return nullptr;
}

void ArchiveEncoder::PutUInt32(std::uint32_t value) {
  for (int shift = 0; shift < 32; shift += 8) PutByte(static_cast<std::uint8_t>(value >> shift));
}

void ArchiveEncoder::PutUInt64(std::uint64_t value) {
  for (int shift = 0; shift < 64; shift += 8) PutByte(static_cast<std::uint8_t>(value >> shift));
}

void ArchiveEncoder::PutXUID(const XUID& value) {
  PutUInt64(value.High());
  PutUInt64(value.Low());
}

bool ArchiveDecoder::TakeByte(std::uint8_t* value) {
  std::uint64_t wide = 0;
  if (!TakeLittleEndian(1, &wide)) return false;
  *value = static_cast<std::uint8_t>(wide);
  return true;
}

bool ArchiveDecoder::TakeUInt32(std::uint32_t* value) {
  std::uint64_t wide = 0;
  if (!TakeLittleEndian(4, &wide)) return false;
  *value = static_cast<std::uint32_t>(wide);
  return true;
}

bool ArchiveDecoder::TakeUInt64(std::uint64_t* value) { return TakeLittleEndian(8, value); }

bool ArchiveDecoder::TakeXUID(XUID* value) {
  if (Remaining() < 16) return false;
  std::uint64_t high = 0;
  std::uint64_t low = 0;
  TakeUInt64(&high);
  TakeUInt64(&low);
  *value = XUID(high, low);
  return true;
}

bool ArchiveDecoder::TakeBytes(std::size_t count, std::string_view* bytes) {
  if (count > Remaining()) return false;
  *bytes = bytes_.substr(position_, count);
  position_ += count;
  return true;
}

bool ArchiveDecoder::TakeLittleEndian(std::size_t width, std::uint64_t* value) {
  if (width > Remaining()) return false;
  std::uint64_t result = 0;
  for (std::size_t i = 0; i < width; ++i)
    result |= static_cast<std::uint64_t>(static_cast<unsigned char>(bytes_[position_ + i])) << (8 * i);
  position_ += width;
  *value = result;
  return true;
}

}  // namespace Port
