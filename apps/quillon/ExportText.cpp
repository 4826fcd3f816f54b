#include "ExportText.h"

#include <algorithm>
#include <cctype>

namespace quillon {

namespace {

bool IsShellLiteral(unsigned char c) {
  return std::isalnum(c) || std::string_view("_./+=:,@%-").find(c) != std::string_view::npos;
}

}  // namespace

std::string ExportText::ShellWord(std::string_view text) {
  if (!text.empty() && std::all_of(text.begin(), text.end(), IsShellLiteral)) return std::string(text);
  std::string quoted = "'";
  for (char c : text) quoted += c == '\'' ? std::string("'\\''") : std::string(1, c);
  return quoted + "'";
}

std::string ExportText::DollarsDoubled(std::string_view text) {
  std::string doubled;
  for (char c : text) doubled += c == '$' ? std::string("$$") : std::string(1, c);
  return doubled;
}

std::string ExportText::SafeBaseName(std::string_view path) {
  std::string name(path.substr(path.rfind('/') + 1));
  for (char& c : name) {
    if (!std::isalnum(static_cast<unsigned char>(c)) && c != '.' && c != '_' && c != '-') c = '_';
  }
  return name;
}

}  // namespace quillon
