#include "vci/VerilogLexer.h"

#include <limits>

#include "vci/VerilogChars.h"
#include "vci/VerilogMessageText.h"

namespace Hx_Vci {

using VerilogChars::IsDigit;
using VerilogChars::IsIdentifierChar;
using VerilogChars::IsIdentifierStart;
using VerilogChars::IsLineSpace;
using VerilogChars::IsSpace;

namespace {

constexpr std::size_t kNoSegment = std::numeric_limits<std::size_t>::max();

bool IsBaseLetter(char c) {
  switch (c) {
    case 'b':
    case 'B':
    case 'o':
    case 'O':
    case 'd':
    case 'D':
    case 'h':
    case 'H':
      return true;
    default:
      return false;
  }
}

bool IsBasedDigit(char c) {
  return IsIdentifierChar(c) || c == '?';  // hex digits, x, z and '_' are all identifier characters
}

bool IsPunctuation(char c) { return c > ' ' && c < 0x7f && !IsIdentifierChar(c); }

}  // namespace

VerilogLexer::VerilogLexer(const VerilogPreprocessedText& source, VerilogMessageLog& log)
    : source_(source), text_(source.text), log_(log) {
  EnterSegment(0);
}

void VerilogLexer::Reset(const Position& position) {
  EnterSegment(position.segment);
  pos_ = position.pos;
  line_ = position.line;
  fileId_ = position.fileId;
}

void VerilogLexer::EnterSegment(std::size_t segment) {
  segment_ = segment;
  if (segment < source_.segments.size()) {
    line_ = source_.segments[segment].line;
    fileId_ = source_.segments[segment].fileId;
  }
  nextSegmentOffset_ =
      segment + 1 < source_.segments.size() ? source_.segments[segment + 1].offset : kNoSegment;
}

void VerilogLexer::PassLineBreak() {
  ++line_;
  while (pos_ >= nextSegmentOffset_) {
    EnterSegment(segment_ + 1);
  }
}

VerilogToken VerilogLexer::Next() {
  SkipSpaceAndAttributes();
  const std::uint32_t line = line_;
  const std::uint32_t fileId = fileId_;
  const std::size_t start = pos_;
  if (start >= text_.size()) {
    return Make(VerilogTokenKind::kEnd, start, start, line, fileId);
  }
  const char c = text_[start];
  if (IsIdentifierStart(c)) {
    std::size_t end = start + 1;
    while (end < text_.size() && IsIdentifierChar(text_[end])) ++end;
    pos_ = end;
    VerilogToken token = Make(VerilogTokenKind::kIdentifier, start, end, line, fileId);
    token.keyword = VerilogKeywords::Find(token.text);
    if (token.keyword != VerilogKeyword::kNone) {
      token.kind = VerilogTokenKind::kKeyword;
    }
    return token;
  }
  if (IsDigit(c) || (c == '\'' && StartsBasedValue(start))) {
    pos_ = ScanNumber(start);
    return Make(VerilogTokenKind::kNumber, start, pos_, line, fileId);
  }
  if (c == '\\' || c == '$') {
    std::size_t end = start + 1;
    if (c == '\\') {
      while (end < text_.size() && !IsSpace(text_[end])) ++end;
    } else {
      while (end < text_.size() && IsIdentifierChar(text_[end])) ++end;
    }
    pos_ = end;
    if (end == start + 1) {
      return Make(c == '$' ? VerilogTokenKind::kPunct : VerilogTokenKind::kOther, start, end, line, fileId);
    }
    return c == '\\' ? Make(VerilogTokenKind::kIdentifier, start + 1, end, line, fileId)
                     : Make(VerilogTokenKind::kSystemName, start, end, line, fileId);
  }
  if (c == '"') {
    pos_ = ScanString(start);
    return Make(VerilogTokenKind::kString, start, pos_, line, fileId);
  }
  if (IsPunctuation(c)) {
    pos_ = start + 1;
    return Make(VerilogTokenKind::kPunct, start, pos_, line, fileId);
  }
  std::size_t end = start + 1;
  while (end < text_.size() && !IsSpace(text_[end]) && !IsIdentifierChar(text_[end]) &&
         !IsPunctuation(text_[end])) {
    ++end;
  }
  pos_ = end;
  return Make(VerilogTokenKind::kOther, start, end, line, fileId);
}

VerilogToken VerilogLexer::Make(VerilogTokenKind kind, std::size_t from, std::size_t to, std::uint32_t line,
                                std::uint32_t fileId) {
  VerilogToken token;
  token.kind = kind;
  token.text = text_.substr(from, to - from);
  token.line = line;
  token.fileId = fileId;
  return token;
}

void VerilogLexer::SkipSpaceAndAttributes() {
  while (pos_ < text_.size()) {
    const char c = text_[pos_];
    if (c == '\n') {
      ++pos_;
      PassLineBreak();
    } else if (IsSpace(c)) {
      ++pos_;
    } else if (c == '(' && AtAttribute()) {
      if (!SkipAttribute()) {
        return;
      }
    } else {
      return;
    }
  }
}

// "(*" starts an attribute unless it is the event control "(*)", spaces allowed.
bool VerilogLexer::AtAttribute() const {
  if (pos_ + 1 >= text_.size() || text_[pos_ + 1] != '*') {
    return false;
  }
  std::size_t after = pos_ + 2;
  while (after < text_.size() && IsSpace(text_[after])) ++after;
  return after < text_.size() && text_[after] != ')';
}

bool VerilogLexer::SkipAttribute() {
  const std::size_t close = text_.find("*)", pos_ + 2);
  if (close == std::string_view::npos) {
    log_.Error(FileName(fileId_), static_cast<int>(line_), VerilogMessageText::kUnterminatedAttribute);
    return false;
  }
  while (pos_ < close + 2) {
    if (text_[pos_++] == '\n') {
      PassLineBreak();
    }
  }
  return true;
}

std::size_t VerilogLexer::ScanNumber(std::size_t from) const {
  std::size_t p = from;
  while (p < text_.size()) {
    const char c = text_[p];
    const bool exponentSign = (c == '+' || c == '-') && p > from &&
                              (text_[p - 1] == 'e' || text_[p - 1] == 'E') && p + 1 < text_.size() &&
                              IsDigit(text_[p + 1]);
    const bool fraction = c == '.' && p + 1 < text_.size() && IsDigit(text_[p + 1]);
    if (!IsIdentifierChar(c) && !exponentSign && !fraction) {
      break;
    }
    ++p;
  }
  std::size_t quote = p;
  while (quote < text_.size() && IsLineSpace(text_[quote])) ++quote;
  if (quote < text_.size() && text_[quote] == '\'' && StartsBasedValue(quote)) {
    return ScanBasedValue(quote);
  }
  return p;
}

bool VerilogLexer::StartsBasedValue(std::size_t quote) const {
  std::size_t p = quote + 1;
  if (p < text_.size() && (text_[p] == 's' || text_[p] == 'S')) ++p;
  return p < text_.size() && IsBaseLetter(text_[p]);
}

std::size_t VerilogLexer::ScanBasedValue(std::size_t quote) const {
  std::size_t p = quote + 1;
  if (text_[p] == 's' || text_[p] == 'S') ++p;
  ++p;  // the base letter
  while (p < text_.size() && IsLineSpace(text_[p])) ++p;
  while (p < text_.size() && IsBasedDigit(text_[p])) ++p;
  return p;
}

std::size_t VerilogLexer::ScanString(std::size_t from) {
  std::size_t p = from + 1;
  while (p < text_.size() && text_[p] != '"') {
    if (text_[p] == '\\' && p + 1 < text_.size()) {
      ++p;
    }
    if (text_[p] == '\n') {
      pos_ = p + 1;
      PassLineBreak();
    }
    ++p;
  }
  return p < text_.size() ? p + 1 : p;
}

}  // namespace Hx_Vci
