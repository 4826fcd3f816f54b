// Loads one design file whole for the lexers.
#pragma once

#include <cstdint>
#include <string>

namespace PepSourceFile {

constexpr std::uintmax_t kMaxSize = std::uintmax_t{256} << 20;

enum class Status { kRead, kUnreadable, kTooLarge };

// Reads `path` into `text` unless it is no readable regular file or is larger than kMaxSize.
Status Load(const std::string& path, std::string& text);

}  // namespace PepSourceFile
