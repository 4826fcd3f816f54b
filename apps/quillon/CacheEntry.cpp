#include "CacheEntry.h"

#include "Port/ArchiveCodec.h"

namespace quillon {

namespace {

constexpr std::string_view kEntryMagic{"\x89QLNPCE\n", 8};
constexpr std::size_t kEntryHeaderSize = kEntryMagic.size() + 4 + 8 + 8;  // magic, version, length, sum
constexpr std::uint32_t kMaxMessages = 1u << 20;

void PutString(Port::ArchiveEncoder& out, std::string_view text) {
  out.PutUInt32(static_cast<std::uint32_t>(text.size()));
  out.PutBytes(text);
}

bool TakeString(Port::ArchiveDecoder& in, std::string& text) {
  std::uint32_t size = 0;
  std::string_view bytes;
  if (!in.TakeUInt32(&size) || !in.TakeBytes(size, &bytes)) return false;
  text.assign(bytes);
  return true;
}

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

std::string CacheEntry::Encode() const {
  Port::ArchiveEncoder payload;
  PutString(payload, key);
  payload.PutUInt32(static_cast<std::uint32_t>(messages.size()));
  for (const Port_MsgRecord& message : messages) {
    payload.PutUInt32(static_cast<std::uint32_t>(message.type));
    PutString(payload, message.text);
    PutString(payload, message.category);
    PutString(payload, message.sourceFile);
    payload.PutUInt32(static_cast<std::uint32_t>(message.line));
    PutString(payload, message.revision);
    payload.PutUInt32(static_cast<std::uint32_t>(message.number));
  }
  PutString(payload, records);

  Port::ArchiveEncoder whole;
  whole.PutBytes(kEntryMagic);
  whole.PutUInt32(kFormatVersion);
  whole.PutUInt64(payload.Bytes().size());
  whole.PutUInt64(Hash(payload.Bytes()));
  whole.PutBytes(payload.Bytes());
  return whole.Bytes();
}

bool CacheEntry::Decode(std::string_view bytes) {
  Port::ArchiveDecoder header(bytes);
  std::string_view magic;
  std::uint32_t version = 0;
  std::uint64_t length = 0, sum = 0;
  if (!header.TakeBytes(kEntryMagic.size(), &magic) || magic != kEntryMagic || !header.TakeUInt32(&version) ||
      version != kFormatVersion || !header.TakeUInt64(&length) || !header.TakeUInt64(&sum) ||
      length != header.Remaining())
    return false;
  std::string_view payloadBytes = bytes.substr(kEntryHeaderSize);
  if (Hash(payloadBytes) != sum) return false;

  Port::ArchiveDecoder in(payloadBytes);
  std::uint32_t count = 0;
  if (!TakeString(in, key) || !in.TakeUInt32(&count) || count > kMaxMessages) return false;
  messages.clear();
  for (std::uint32_t i = 0; i < count; ++i) {
    Port_MsgRecord message;
    int type = 0;
    if (!TakeInt(in, type) || type < Port_MsgMan::kError || type > Port_MsgMan::kUserFatal ||
        !TakeString(in, message.text) || !TakeString(in, message.category) ||
        !TakeString(in, message.sourceFile) || !TakeInt(in, message.line) ||
        !TakeString(in, message.revision) || !TakeInt(in, message.number))
      return false;
    message.type = static_cast<Port_MsgMan::MsgType>(type);
    messages.push_back(std::move(message));
  }
  return TakeString(in, records) && in.Remaining() == 0;
}

}  // namespace quillon
