// The host's 8-bit string, used for every name, key and path.
#pragma once

#include <cstdarg>
#include <cstddef>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace Port {

// Comparison types of StringBase::Compare.
enum CompareType : int {
  kCompareExact = 0,   // byte order
  kCompareNoCase = 1,  // ASCII letters folded to lower case, then byte order
};

class StringBase {
 public:
  static constexpr std::size_t npos = std::string::npos;

  StringBase() = default;
  StringBase(const char* text) : text_(text ? text : "") {}  // NOLINT: implicit by design
  StringBase(const char* text, std::size_t length)
      : text_(text ? std::string(text, length) : std::string()) {}
  StringBase(std::string_view text) : text_(text) {}        // NOLINT
  StringBase(std::string text) : text_(std::move(text)) {}  // NOLINT

  const char* c_str() const { return text_.c_str(); }
  const std::string& str() const { return text_; }
  std::string_view view() const { return text_; }
  operator std::string_view() const { return text_; }  // NOLINT
  std::size_t Length() const { return text_.size(); }
  bool IsEmpty() const { return text_.empty(); }
  void Empty() { text_.clear(); }
  char operator[](std::size_t i) const { return text_[i]; }

  StringBase& operator=(std::string_view text) {
    text_.assign(text);
    return *this;
  }
  StringBase& operator=(const char* text) {
    text_.assign(text ? text : "");
    return *this;
  }
  StringBase& operator=(std::string text) {
    text_ = std::move(text);
    return *this;
  }
  StringBase& operator+=(std::string_view text) {
    text_.append(text);
    return *this;
  }
  StringBase& operator+=(char c) {
    text_.push_back(c);
    return *this;
  }
  StringBase& Append(std::string_view text) {
    text_.append(text);
    return *this;
  }
  StringBase& Append(char c) {
    text_.push_back(c);
    return *this;
  }

  // printf-style; Format replaces the text, AppendFormat appends to it. Any length.
  StringBase& Format(const char* format, ...) __attribute__((format(printf, 2, 3)));
  StringBase& AppendFormat(const char* format, ...) __attribute__((format(printf, 2, 3)));
  StringBase& FormatV(const char* format, std::va_list args);
  StringBase& AppendFormatV(const char* format, std::va_list args);

  // <0, 0 or >0 like strcmp, under the given comparison type.
  int Compare(std::string_view other, int compareType = kCompareExact) const;
  bool Equals(std::string_view other, int compareType = kCompareExact) const {
    return Compare(other, compareType) == 0;
  }

  std::size_t Find(std::string_view what, std::size_t from = 0) const { return text_.find(what, from); }
  std::size_t Find(char c, std::size_t from = 0) const { return text_.find(c, from); }
  std::size_t ReverseFind(char c) const { return text_.rfind(c); }
  bool StartsWith(std::string_view prefix) const { return text_.starts_with(prefix); }
  bool EndsWith(std::string_view suffix) const { return text_.ends_with(suffix); }

  StringBase Mid(std::size_t start, std::size_t count = npos) const;
  StringBase Left(std::size_t count) const { return Mid(0, count); }
  StringBase Right(std::size_t count) const;

  // Replaces every occurrence of `what` (non-empty) with `with`; returns the number replaced.
  std::size_t ReplaceAll(std::string_view what, std::string_view with);
  // Removes every occurrence of `what`; returns the number removed.
  std::size_t RemoveAll(std::string_view what) { return ReplaceAll(what, {}); }

  // ASCII case change.
  StringBase& MakeUpper();
  StringBase& MakeLower();

  // Trimming removes the given characters (blank, tab, carriage return, line feed by default).
  StringBase& Trim(std::string_view chars = " \t\r\n");
  StringBase& TrimLeft(std::string_view chars = " \t\r\n");
  StringBase& TrimRight(std::string_view chars = " \t\r\n");
  // Keeps at most `length` characters.
  StringBase& Truncate(std::size_t length);

  // Token ranges: starting at `position`, skips delimiters and reports the next token's start and
  // length; `position` moves past it. False when no token is left.
  bool GetNextTokenRange(std::size_t& position, std::string_view delimiters, std::size_t& start,
                         std::size_t& length) const;

  // Splits at any character of `delimiters` into `pieces` (which is emptied first). With
  // `keepEmpty` false, empty pieces are dropped. A piece that begins with `openQuote` runs to the
  // next `closeQuote`, delimiters inside it included; the quotes stay in the piece. Empty quote
  // texts disable quoting. Returns the number of pieces.
  std::size_t Split(std::vector<StringBase>& pieces, std::string_view delimiters, bool keepEmpty = false,
                    std::string_view openQuote = {}, std::string_view closeQuote = {}) const;

  // Searches for the extended regular expression `pattern` (POSIX ERE syntax) from `from`.
  // True with the match's start and length; false when nothing matches or the pattern is
  // invalid.
  bool GetRangeOfMatch(std::string_view pattern, std::size_t& start, std::size_t& length,
                       std::size_t from = 0) const;

  friend bool operator==(const StringBase& a, const StringBase& b) { return a.text_ == b.text_; }
  friend bool operator==(const StringBase& a, std::string_view b) { return a.text_ == b; }
  friend bool operator==(const StringBase& a, const char* b) { return b && a.text_ == b; }
  friend bool operator==(const StringBase& a, const std::string& b) { return a.text_ == b; }
  friend auto operator<=>(const StringBase& a, const StringBase& b) { return a.text_ <=> b.text_; }
  friend StringBase operator+(StringBase a, std::string_view b) {
    a += b;
    return a;
  }

 private:
  std::string text_;
};

// Case-insensitive (ASCII) strcmp.
int stricmp(const char* a, const char* b);
// A copy made with cvn_malloc; release with cvn_free. Null for null.
char* strdup(const char* text);

}  // namespace Port
