// Splits preprocessed Verilog text into the tokens the module parser needs. Attributes (* ... *)
// are skipped; escaped identifiers come as identifiers without their backslash. Every token knows
// its file and line in the original sources.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

#include "vci/VerilogKeywords.h"
#include "vci/VerilogMessageLog.h"
#include "vci/VerilogPreprocessedText.h"

namespace Hx_Vci {

enum class VerilogTokenKind : std::uint8_t {
  kEnd,
  kIdentifier,
  kKeyword,
  kSystemName,  // $display
  kNumber,
  kString,
  kPunct,  // one character
  kOther,  // bytes that are no Verilog
};

struct VerilogToken {
  VerilogTokenKind kind = VerilogTokenKind::kEnd;
  VerilogKeyword keyword = VerilogKeyword::kNone;
  std::string_view text;  // points into the preprocessed text
  std::uint32_t line = 0;
  std::uint32_t fileId = 0;

  bool IsEnd() const { return kind == VerilogTokenKind::kEnd; }
  bool IsName() const { return kind == VerilogTokenKind::kIdentifier; }
  bool Is(VerilogKeyword k) const { return keyword == k; }
  bool IsPunct(char c) const { return kind == VerilogTokenKind::kPunct && text[0] == c; }
};

class VerilogLexer {
 public:
  // Where the lexer stands; Reset returns to it.
  struct Position {
    std::size_t pos = 0;
    std::uint32_t line = 1;
    std::uint32_t fileId = 0;
    std::size_t segment = 0;
  };

  // Both must outlive the lexer.
  VerilogLexer(const VerilogPreprocessedText& source, VerilogMessageLog& log);

  // The next token; kEnd at the end, and again on every later call.
  VerilogToken Next();
  Position Mark() const { return {pos_, line_, fileId_, segment_}; }
  void Reset(const Position& position);

  const std::string& FileName(std::uint32_t fileId) const { return source_.fileNames[fileId]; }

 private:
  void SkipSpaceAndAttributes();
  void PassLineBreak();  // pos_ is just past a '\n'
  void EnterSegment(std::size_t segment);
  bool AtAttribute() const;
  bool SkipAttribute();
  std::size_t ScanNumber(std::size_t from) const;
  std::size_t ScanBasedValue(std::size_t quote) const;  // quote: the position of '\''
  bool StartsBasedValue(std::size_t quote) const;
  std::size_t ScanString(std::size_t from);
  VerilogToken Make(VerilogTokenKind kind, std::size_t from, std::size_t to, std::uint32_t line,
                    std::uint32_t fileId);

  const VerilogPreprocessedText& source_;
  std::string_view text_;
  VerilogMessageLog& log_;
  std::size_t pos_ = 0;
  std::uint32_t line_ = 1;
  std::uint32_t fileId_ = 0;
  std::size_t segment_ = 0;
  std::size_t nextSegmentOffset_ = 0;
};

}  // namespace Hx_Vci
