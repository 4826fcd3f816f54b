#include "Port/StringBase.h"

#include <regex.h>

#include <algorithm>
#include <cstdio>
#include <cstring>
#include <functional>
#include <memory>
#include <unordered_map>

#include "Port/Memory.h"

namespace Port {
namespace {

char FoldCase(char c) { return (c >= 'A' && c <= 'Z') ? static_cast<char>(c - 'A' + 'a') : c; }
char RaiseCase(char c) { return (c >= 'a' && c <= 'z') ? static_cast<char>(c - 'a' + 'A') : c; }

int CompareBytes(unsigned char a, unsigned char b) { return a < b ? -1 : (a > b ? 1 : 0); }

int CompareNoCase(std::string_view a, std::string_view b) {
  std::size_t common = std::min(a.size(), b.size());
  for (std::size_t i = 0; i < common; ++i) {
    int order =
        CompareBytes(static_cast<unsigned char>(FoldCase(a[i])), static_cast<unsigned char>(FoldCase(b[i])));
    if (order != 0) return order;
  }
  return a.size() < b.size() ? -1 : (a.size() > b.size() ? 1 : 0);
}

int Sign(int value) { return value < 0 ? -1 : (value > 0 ? 1 : 0); }

bool IsAnyOf(char c, std::string_view chars) { return chars.find(c) != std::string_view::npos; }

// The printf-style text of `format` appended to `out`; `out` is unchanged on an encoding error.
void AppendFormatted(std::string& out, const char* format, std::va_list args) {
  if (!format) return;
  std::va_list measure;
  va_copy(measure, args);
  int needed = std::vsnprintf(nullptr, 0, format, measure);
  va_end(measure);
  if (needed <= 0) return;
  std::size_t oldSize = out.size();
  out.resize(oldSize + static_cast<std::size_t>(needed) + 1);
  std::vsnprintf(out.data() + oldSize, static_cast<std::size_t>(needed) + 1, format, args);
  out.resize(oldSize + static_cast<std::size_t>(needed));
}

// A compiled POSIX pattern; an invalid pattern is remembered too, so that it fails cheaply.
class CompiledPattern {
 public:
  explicit CompiledPattern(const std::string& pattern)
      : valid_(regcomp(&regex_, pattern.c_str(), REG_EXTENDED) == 0) {}
  ~CompiledPattern() {
    if (valid_) regfree(&regex_);
  }
  CompiledPattern(const CompiledPattern&) = delete;
  CompiledPattern& operator=(const CompiledPattern&) = delete;

  bool IsValid() const { return valid_; }
  const regex_t* Regex() const { return &regex_; }

 private:
  regex_t regex_{};
  bool valid_;
};

// Lets the cache be searched with the caller's text, without building a key first.
struct PatternHash {
  using is_transparent = void;
  std::size_t operator()(std::string_view text) const { return std::hash<std::string_view>{}(text); }
};

const CompiledPattern& CachedPattern(std::string_view pattern) {
  // Callers use a handful of fixed patterns; the limit only keeps odd callers from growing it.
  static constexpr std::size_t kMaxCachedPatterns = 64;
  thread_local std::unordered_map<std::string, std::unique_ptr<CompiledPattern>, PatternHash, std::equal_to<>>
      cache;
  auto found = cache.find(pattern);
  if (found != cache.end()) return *found->second;
  if (cache.size() >= kMaxCachedPatterns) cache.clear();
  std::string key(pattern);
  auto compiled = std::make_unique<CompiledPattern>(key);
  return *cache.emplace(std::move(key), std::move(compiled)).first->second;
}

}  // namespace

StringBase& StringBase::Format(const char* format, ...) {
  std::va_list args;
  va_start(args, format);
  FormatV(format, args);
  va_end(args);
  return *this;
}

StringBase& StringBase::AppendFormat(const char* format, ...) {
  std::va_list args;
  va_start(args, format);
  AppendFormatV(format, args);
  va_end(args);
  return *this;
}

StringBase& StringBase::FormatV(const char* format, std::va_list args) {
  // Formatted into a fresh text first: an argument may point into this string.
  std::string formatted;
  AppendFormatted(formatted, format, args);
  text_.swap(formatted);
  return *this;
}

StringBase& StringBase::AppendFormatV(const char* format, std::va_list args) {
  std::string formatted;
  AppendFormatted(formatted, format, args);
  text_.append(formatted);
  return *this;
}

int StringBase::Compare(std::string_view other, int compareType) const {
  if (compareType == kCompareNoCase) return CompareNoCase(text_, other);
  return Sign(std::string_view(text_).compare(other));
}

StringBase StringBase::Mid(std::size_t start, std::size_t count) const {
  if (start >= text_.size()) return StringBase();
  return StringBase(text_.substr(start, count));
}

StringBase StringBase::Right(std::size_t count) const {
  if (count >= text_.size()) return *this;
  return StringBase(text_.substr(text_.size() - count));
}

std::size_t StringBase::ReplaceAll(std::string_view what, std::string_view with) {
  if (what.empty()) return 0;
  std::size_t replaced = 0;
  std::string result;
  std::size_t copied = 0;
  for (std::size_t at = text_.find(what); at != std::string::npos; at = text_.find(what, copied)) {
    result.append(text_, copied, at - copied).append(with);
    copied = at + what.size();
    ++replaced;
  }
  if (replaced == 0) return 0;
  result.append(text_, copied, std::string::npos);
  text_.swap(result);
  return replaced;
}

StringBase& StringBase::MakeUpper() {
  std::transform(text_.begin(), text_.end(), text_.begin(), RaiseCase);
  return *this;
}

StringBase& StringBase::MakeLower() {
  std::transform(text_.begin(), text_.end(), text_.begin(), FoldCase);
  return *this;
}

StringBase& StringBase::Trim(std::string_view chars) { return TrimRight(chars).TrimLeft(chars); }

StringBase& StringBase::TrimLeft(std::string_view chars) {
  std::size_t first = text_.find_first_not_of(chars);
  text_.erase(0, first == std::string::npos ? text_.size() : first);
  return *this;
}

StringBase& StringBase::TrimRight(std::string_view chars) {
  std::size_t last = text_.find_last_not_of(chars);
  text_.erase(last == std::string::npos ? 0 : last + 1);
  return *this;
}

StringBase& StringBase::Truncate(std::size_t length) {
  if (length < text_.size()) text_.resize(length);
  return *this;
}

bool StringBase::GetNextTokenRange(std::size_t& position, std::string_view delimiters, std::size_t& start,
                                   std::size_t& length) const {
  std::size_t first = position < text_.size() ? text_.find_first_not_of(delimiters, position) : npos;
  if (first == npos) {
    position = text_.size();
    return false;
  }
  std::size_t end = text_.find_first_of(delimiters, first);
  if (end == npos) end = text_.size();
  start = first;
  length = end - first;
  position = end;
  return true;
}

std::size_t StringBase::Split(std::vector<StringBase>& pieces, std::string_view delimiters, bool keepEmpty,
                              std::string_view openQuote, std::string_view closeQuote) const {
  pieces.clear();
  const bool quoting = !openQuote.empty() && !closeQuote.empty();
  const std::string_view text(text_);
  std::size_t pieceStart = 0;
  while (true) {
    std::size_t scan = pieceStart;
    if (quoting && text.substr(pieceStart).starts_with(openQuote)) {
      std::size_t close = text.find(closeQuote, pieceStart + openQuote.size());
      scan = close == npos ? text.size() : close + closeQuote.size();
    }
    std::size_t end = scan;
    while (end < text.size() && !IsAnyOf(text[end], delimiters)) ++end;
    if (keepEmpty || end > pieceStart) pieces.emplace_back(text.substr(pieceStart, end - pieceStart));
    if (end >= text.size()) break;
    pieceStart = end + 1;
  }
  return pieces.size();
}

bool StringBase::GetRangeOfMatch(std::string_view pattern, std::size_t& start, std::size_t& length,
                                 std::size_t from) const {
  if (from > text_.size() || pattern.find('\0') != std::string_view::npos) return false;
  const CompiledPattern& compiled = CachedPattern(pattern);
  if (!compiled.IsValid()) return false;
  // REG_STARTEND bounds the search without copying and keeps the text before `from` as context,
  // so "^" still means the start of the whole text.
  regmatch_t match[1];
  match[0].rm_so = static_cast<regoff_t>(from);
  match[0].rm_eo = static_cast<regoff_t>(text_.size());
  if (regexec(compiled.Regex(), text_.c_str(), 1, match, REG_STARTEND) != 0) return false;
  if (match[0].rm_so < 0 || match[0].rm_eo < match[0].rm_so) return false;
  start = static_cast<std::size_t>(match[0].rm_so);
  length = static_cast<std::size_t>(match[0].rm_eo - match[0].rm_so);
  return true;
}

int stricmp(const char* a, const char* b) {
  if (!a || !b) return (a ? 1 : 0) - (b ? 1 : 0);
  return CompareNoCase(a, b);
}

char* strdup(const char* text) {
  if (!text) return nullptr;
  std::size_t size = std::strlen(text) + 1;
  auto* copy = static_cast<char*>(cvn_malloc(size));
  if (copy) std::memcpy(copy, text, size);
  return copy;
}

}  // namespace Port
