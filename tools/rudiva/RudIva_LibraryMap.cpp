#include "rudiva/RudIva_LibraryMap.h"

#include <algorithm>

#include "Port/Env.h"

namespace RudIva_LibraryMap {

namespace {

char ToLower(char c) { return (c >= 'A' && c <= 'Z') ? static_cast<char>(c - 'A' + 'a') : c; }

bool EqualIgnoringCase(std::string_view a, std::string_view b) {
  return a.size() == b.size() &&
         std::equal(a.begin(), a.end(), b.begin(), [](char x, char y) { return ToLower(x) == ToLower(y); });
}

std::string_view Trim(std::string_view text) {
  constexpr std::string_view kBlanks = " \t\r\f\v";
  std::size_t first = text.find_first_not_of(kBlanks);
  if (first == std::string_view::npos) return {};
  std::size_t last = text.find_last_not_of(kBlanks);
  return text.substr(first, last - first + 1);
}

// False at the end of the input. A line longer than the limit comes back marked `tooLong`, with
// the rest of it read and dropped so that memory stays bounded.
bool ReadLine(std::istream& in, std::string& line, bool& tooLong) {
  line.clear();
  tooLong = false;
  char c = 0;
  bool readAny = false;
  while (in.get(c)) {
    readAny = true;
    if (c == '\n') return true;
    if (line.size() < kMaxLineLength) {
      line.push_back(c);
    } else {
      tooLong = true;
    }
  }
  return readAny;
}

bool IsIgnoredLine(std::string_view line) {
  return line.empty() || line.front() == '#' || line.front() == ';' || line.front() == '[';
}

bool IsNameChar(char c) {
  return (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z') || (c >= '0' && c <= '9') || c == '_';
}

}  // namespace

std::optional<std::string> FindDirectory(std::istream& in, std::string_view library) {
  std::string line;
  bool tooLong = false;
  while (ReadLine(in, line, tooLong)) {
    std::string_view text = Trim(line);
    std::size_t equals = text.find('=');
    if (tooLong || IsIgnoredLine(text) || equals == std::string_view::npos) continue;
    if (EqualIgnoringCase(Trim(text.substr(0, equals)), library)) {
      return std::string(Trim(text.substr(equals + 1)));
    }
  }
  return std::nullopt;
}

std::optional<std::string> ExpandVariables(std::string_view text) {
  std::string expanded;
  std::size_t i = 0;
  while (i < text.size()) {
    if (text[i] != '$') {
      expanded.push_back(text[i++]);
      continue;
    }
    std::size_t nameStart = i + 1;
    bool braced = nameStart < text.size() && text[nameStart] == '{';
    if (braced) ++nameStart;
    std::size_t nameEnd = nameStart;
    while (nameEnd < text.size() && IsNameChar(text[nameEnd])) ++nameEnd;
    if (braced && (nameEnd == text.size() || text[nameEnd] != '}' || nameEnd == nameStart))
      return std::nullopt;
    if (nameEnd == nameStart) {
      expanded.push_back(text[i++]);
      continue;
    }
    const char* value = Port_Env::GetEnv(std::string(text.substr(nameStart, nameEnd - nameStart)).c_str());
    if (!value) return std::nullopt;
    expanded.append(value);
    i = braced ? nameEnd + 1 : nameEnd;
  }
  return expanded;
}

}  // namespace RudIva_LibraryMap
