// Quoting shared by the export formats.
#pragma once

#include <string>
#include <string_view>

namespace quillon {

class ExportText {
 public:
  // `text` as one word of a POSIX shell command: unchanged when it holds only characters that
  // the shell takes literally, otherwise in single quotes.
  static std::string ShellWord(std::string_view text);
  // `text` with every '$' doubled, as make and ninja read a literal '$'.
  static std::string DollarsDoubled(std::string_view text);
  // The file name of `path` with every character other than letters, digits, '.', '_' and '-'
  // replaced by '_', for names derived from it.
  static std::string SafeBaseName(std::string_view path);
};

}  // namespace quillon
