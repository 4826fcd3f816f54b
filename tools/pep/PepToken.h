// One token of a design file as the port extractor's lexers hand it to the readers.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

enum class PepLanguage { kVerilog, kVhdl };

struct PepToken {
  enum class Kind {
    kEnd,
    kName,    // identifiers, keywords and system names ($clog2)
    kNumber,  // value holds the integer when it is one that fits
    kString,  // string and character literals
    kMacro,   // a Verilog `NAME that is no known directive
    kSymbol,  // delimiters and operators, one or two characters
    kOther,   // bytes that belong to no token of the language
  };

  // Longer tokens are cut: no reader needs more, and memory stays bounded on junk input.
  static constexpr std::size_t kMaxTextLength = 4096;

  Kind kind = Kind::kEnd;
  std::string text;  // as written; escaped Verilog identifiers without their backslash
  // What names are compared by: lower case for VHDL basic identifiers, the text otherwise.
  std::string key;
  std::optional<std::int64_t> value;
  bool escaped = false;  // an escaped or extended identifier, never a keyword

  bool IsEnd() const { return kind == Kind::kEnd; }
  bool IsName() const { return kind == Kind::kName; }
  // A keyword or plain identifier spelled `word` (VHDL: in any letter case).
  bool IsWord(std::string_view word) const { return kind == Kind::kName && !escaped && key == word; }
  bool IsSymbol(std::string_view symbol) const { return kind == Kind::kSymbol && text == symbol; }
};

using PepTokens = std::vector<PepToken>;
