// One entry of the parse cache as bytes: a header (magic, format version, payload length, payload
// checksum), then the key, the messages of the parse and the module's archive of the records.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "Port/ArchiveCodec.h"
#include "Port/MsgMan.h"

namespace quillon {

struct CacheEntry {
  static constexpr std::uint32_t kFormatVersion = 1;

  std::string key;
  std::vector<Port_MsgRecord> messages;
  std::string records;  // the module's archive

  std::string Encode() const;
  // False, with the entry in an unspecified state, for bytes that are cut, damaged, of another
  // format or version, or longer than the entry.
  bool Decode(std::string_view bytes);

  // FNV-1a, 64 bits: the checksum of entries and the content hash of sources.
  static std::uint64_t Hash(std::string_view bytes);

  // The frame every file of the cache directory has: magic, format version, payload length and
  // payload checksum, then the payload.
  static std::string Framed(std::string_view magic, std::uint32_t version, std::string_view payload);
  // The payload; nothing for bytes that are cut, damaged, of another magic or version, or longer
  // than the frame says.
  static std::optional<std::string_view> Unframed(std::string_view bytes, std::string_view magic,
                                                  std::uint32_t version);
  // A length-prefixed text inside a payload.
  static void PutText(Port::ArchiveEncoder& out, std::string_view text);
  static bool TakeText(Port::ArchiveDecoder& in, std::string& text);
};

}  // namespace quillon
