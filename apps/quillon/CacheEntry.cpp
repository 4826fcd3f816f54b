#include "CacheEntry.h"

#include "Port/ArchiveCodec.h"

namespace quillon {

namespace {

constexpr std::string_view kEntryMagic{"\x89QLNPCE\n", 8};
constexpr std::uint32_t kMaxMessages = 1u << 20;

bool TakeInt(Port::ArchiveDecoder& in, int& value) {
  std::uint32_t raw = 0;
  if (!in.TakeUInt32(&raw)) return false;
  value = static_cast<int>(static_cast<std::int32_t>(raw));
  return true;
}

}  // namespace

std::uint64_t CacheEntry::Hash(std::string_view bytes) {
  std::uint64_t hash = 14695981039346656037ull;
  for (unsigned char c : bytes) {
    hash ^= c;
    hash *= 1099511628211ull;
  }
  return hash;
}

void CacheEntry::PutText(Port::ArchiveEncoder& out, std::string_view text) {
  out.PutUInt32(static_cast<std::uint32_t>(text.size()));
  out.PutBytes(text);
}

bool CacheEntry::TakeText(Port::ArchiveDecoder& in, std::string& text) {
  std::uint32_t size = 0;
  std::string_view bytes;
  if (!in.TakeUInt32(&size) || !in.TakeBytes(size, &bytes)) return false;
  text.assign(bytes);
  return true;
}

std::string CacheEntry::Framed(std::string_view magic, std::uint32_t version, std::string_view payload) {
  Port::ArchiveEncoder whole;
  whole.PutBytes(magic);
  whole.PutUInt32(version);
  whole.PutUInt64(payload.size());
  whole.PutUInt64(Hash(payload));
  whole.PutBytes(payload);
  return whole.Bytes();
}

std::optional<std::string_view> CacheEntry::Unframed(std::string_view bytes, std::string_view magic,
                                                     std::uint32_t version) {
  Port::ArchiveDecoder header(bytes);
  std::string_view found;
  std::uint32_t foundVersion = 0;
  std::uint64_t length = 0, sum = 0;
  if (!header.TakeBytes(magic.size(), &found) || found != magic || !header.TakeUInt32(&foundVersion) ||
      foundVersion != version || !header.TakeUInt64(&length) || !header.TakeUInt64(&sum) ||
      length != header.Remaining())
    return std::nullopt;
  std::string_view payload = bytes.substr(header.Position());
  if (Hash(payload) != sum) return std::nullopt;
  return payload;
}

std::string CacheEntry::Encode() const {
  Port::ArchiveEncoder payload;
  PutText(payload, key);
  payload.PutUInt32(static_cast<std::uint32_t>(messages.size()));
  for (const Port_MsgRecord& message : messages) {
    payload.PutUInt32(static_cast<std::uint32_t>(message.type));
    PutText(payload, message.text);
    PutText(payload, message.category);
    PutText(payload, message.sourceFile);
    payload.PutUInt32(static_cast<std::uint32_t>(message.line));
    PutText(payload, message.revision);
    payload.PutUInt32(static_cast<std::uint32_t>(message.number));
  }
  PutText(payload, records);
  return Framed(kEntryMagic, kFormatVersion, payload.Bytes());
}

bool CacheEntry::Decode(std::string_view bytes) {
  std::optional<std::string_view> payload = Unframed(bytes, kEntryMagic, kFormatVersion);
  if (!payload) return false;
  Port::ArchiveDecoder in(*payload);
  std::uint32_t count = 0;
  if (!TakeText(in, key) || !in.TakeUInt32(&count) || count > kMaxMessages) return false;
  messages.clear();
  for (std::uint32_t i = 0; i < count; ++i) {
    Port_MsgRecord message;
    int type = 0;
    if (!TakeInt(in, type) || type < Port_MsgMan::kError || type > Port_MsgMan::kUserFatal ||
        !TakeText(in, message.text) || !TakeText(in, message.category) || !TakeText(in, message.sourceFile) ||
        !TakeInt(in, message.line) || !TakeText(in, message.revision) || !TakeInt(in, message.number))
      return false;
    message.type = static_cast<Port_MsgMan::MsgType>(type);
    messages.push_back(std::move(message));
  }
  return TakeText(in, records) && in.Remaining() == 0;
}

}  // namespace quillon
