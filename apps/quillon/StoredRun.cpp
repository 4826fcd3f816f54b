#include "StoredRun.h"

#include "CacheEntry.h"

namespace quillon {

namespace {

constexpr std::string_view kRunMagic{"\x89QLNRUN\n", 8};
// The fewest bytes a stamp takes: an empty path's length and its numbers.
constexpr std::size_t kSmallestStamp = 4 + InputStamp::kNumbers * 8;

}  // namespace

std::string StoredRun::Encode() const {
  Port::ArchiveEncoder payload;
  CacheEntry::PutText(payload, key);
  payload.PutUInt32(static_cast<std::uint32_t>(inputs.size()));
  for (const InputStamp& input : inputs) input.Encode(payload);
  payload.PutUInt32(static_cast<std::uint32_t>(status));
  payload.PutByte(output.shared ? 1 : 0);
  CacheEntry::PutText(payload, output.out);
  CacheEntry::PutText(payload, output.err);
  return CacheEntry::Framed(kRunMagic, kFormatVersion, payload.Bytes());
}

bool StoredRun::Decode(std::string_view bytes) {
  std::optional<std::string_view> payload = CacheEntry::Unframed(bytes, kRunMagic, kFormatVersion);
  if (!payload) return false;
  Port::ArchiveDecoder in(*payload);
  std::uint32_t count = 0, rawStatus = 0;
  std::uint8_t shared = 0;
  if (!CacheEntry::TakeText(in, key) || !in.TakeUInt32(&count) || count > in.Remaining() / kSmallestStamp)
    return false;
  inputs.clear();
  inputs.reserve(count);
  for (std::uint32_t i = 0; i < count; ++i) {
    if (!inputs.emplace_back().Decode(in)) return false;
  }
  if (!in.TakeUInt32(&rawStatus) || !in.TakeByte(&shared) || shared > 1 ||
      !CacheEntry::TakeText(in, output.out) || !CacheEntry::TakeText(in, output.err))
    return false;
  status = static_cast<std::int32_t>(rawStatus);
  output.shared = shared == 1;
  return in.Remaining() == 0;
}

}  // namespace quillon
