#include "MsgText.h"

#include <climits>
#include <cstdio>
#include <cwchar>

namespace Port::MsgText {
namespace {

constexpr std::size_t kInvalidSequence = static_cast<std::size_t>(-1);
constexpr std::size_t kIncompleteSequence = static_cast<std::size_t>(-2);

std::wstring Widen(std::string_view text) {
  std::wstring wide;
  wide.reserve(text.size());
  std::mbstate_t state{};
  std::size_t pos = 0;
  while (pos < text.size()) {
    wchar_t c = 0;
    std::size_t used = std::mbrtowc(&c, text.data() + pos, text.size() - pos, &state);
    if (used == kInvalidSequence || used == kIncompleteSequence) {
      wide.push_back(L'?');
      state = std::mbstate_t{};
      ++pos;
    } else if (used == 0) {
      ++pos;  // an embedded null character would end the line early
    } else {
      wide.push_back(c);
      pos += used;
    }
  }
  return wide;
}

std::vector<std::wstring> SplitAtLineBreaks(const std::wstring& text) {
  std::vector<std::wstring> lines;
  std::size_t start = 0;
  for (std::size_t brk = text.find(L'\n'); brk != std::wstring::npos; brk = text.find(L'\n', start)) {
    lines.emplace_back(text, start, brk - start);
    start = brk + 1;
  }
  if (lines.empty() || start < text.size()) lines.emplace_back(text, start);
  return lines;
}

void AppendWrapped(std::wstring_view line, std::size_t width, std::vector<std::wstring>& out) {
  while (line.size() > width) {
    std::size_t blank = line.rfind(L' ', width);
    if (blank != std::wstring_view::npos && blank > 0) {
      out.emplace_back(line.substr(0, blank));
      line.remove_prefix(blank + 1);
      if (line.empty()) return;
    } else {
      out.emplace_back(line.substr(0, width));
      line.remove_prefix(width);
    }
  }
  out.emplace_back(line);
}

}  // namespace

std::string FormatV(const char* format, std::va_list args) {
  std::va_list measureArgs;
  va_copy(measureArgs, args);
  int length = std::vsnprintf(nullptr, 0, format, measureArgs);
  va_end(measureArgs);
  if (length < 0) return format;

  std::string text(static_cast<std::size_t>(length), '\0');
  std::va_list writeArgs;
  va_copy(writeArgs, args);
  std::vsnprintf(text.data(), text.size() + 1, format, writeArgs);
  va_end(writeArgs);
  return text;
}

std::vector<std::wstring> SplitLines(std::string_view text, int maxWidth) {
  std::vector<std::wstring> lines = SplitAtLineBreaks(Widen(text));
  if (maxWidth <= 0) return lines;

  std::vector<std::wstring> wrapped;
  wrapped.reserve(lines.size());
  for (const std::wstring& line : lines) AppendWrapped(line, static_cast<std::size_t>(maxWidth), wrapped);
  return wrapped;
}

std::string Narrow(std::wstring_view line) {
  std::string narrow;
  narrow.reserve(line.size());
  std::mbstate_t state{};
  char bytes[MB_LEN_MAX];
  for (wchar_t c : line) {
    std::size_t used = std::wcrtomb(bytes, c, &state);
    if (used == kInvalidSequence) {
      narrow.push_back('?');
      state = std::mbstate_t{};
    } else {
      narrow.append(bytes, used);
    }
  }
  return narrow;
}

}  // namespace Port::MsgText
