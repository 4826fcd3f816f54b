#include "vci/VerilogModuleParser.h"

#include <cstdarg>
#include <optional>
#include <string_view>
#include <utility>

#include "vci/VerilogMessageText.h"

namespace Hx_Vci {

namespace Text = VerilogMessageText;
namespace Role = VerilogKeywordRole;
using K = VerilogKeyword;

namespace {

bool IsCaseKeyword(K keyword) { return keyword == K::kCase || keyword == K::kCasex || keyword == K::kCasez; }

bool IsJoinKeyword(K keyword) {
  return keyword == K::kJoin || keyword == K::kJoinAny || keyword == K::kJoinNone;
}

// Keywords that open a block closed by a keyword, within statements and declarations.
bool OpensKeywordBlock(K keyword) {
  return keyword == K::kBegin || keyword == K::kFork || IsCaseKeyword(keyword);
}

bool ClosesKeywordBlock(K keyword) {
  return keyword == K::kEnd || keyword == K::kEndcase || IsJoinKeyword(keyword);
}

bool OpensGroup(const VerilogToken& token) {
  return token.IsPunct('(') || token.IsPunct('[') || token.IsPunct('{');
}

bool ClosesGroup(const VerilogToken& token) {
  return token.IsPunct(')') || token.IsPunct(']') || token.IsPunct('}');
}

std::string Quoted(const VerilogToken& token) { return VerilogMessageLog::Quote(token.text); }

// The keywords of net, variable, port and parameter declarations: a list of names with ranges and
// initial values, ended by ';'.
bool DeclaresNames(K keyword) {
  switch (keyword) {
    case K::kInput:
    case K::kOutput:
    case K::kInout:
    case K::kWire:
    case K::kReg:
    case K::kTri:
    case K::kTri0:
    case K::kTri1:
    case K::kTriand:
    case K::kTrior:
    case K::kTrireg:
    case K::kWand:
    case K::kWor:
    case K::kUwire:
    case K::kSupply0:
    case K::kSupply1:
    case K::kInteger:
    case K::kReal:
    case K::kRealtime:
    case K::kTime:
    case K::kEvent:
    case K::kParameter:
    case K::kLocalparam:
    case K::kGenvar:
    case K::kLogic:
    case K::kBit:
    case K::kByte:
    case K::kInt:
    case K::kShortint:
    case K::kLongint:
    case K::kShortreal:
    case K::kString:
    case K::kWreal:
      return true;
    default:
      return false;
  }
}

// Data types, which a cast in an initial value names: int'(x).
bool NamesDataType(K keyword) {
  switch (keyword) {
    case K::kReg:
    case K::kInteger:
    case K::kReal:
    case K::kRealtime:
    case K::kTime:
    case K::kLogic:
    case K::kBit:
    case K::kByte:
    case K::kInt:
    case K::kShortint:
    case K::kLongint:
    case K::kShortreal:
    case K::kString:
    case K::kSigned:
    case K::kUnsigned:
    case K::kConst:
      return true;
    default:
      return false;
  }
}

// Keywords that no declaration holds after a declared name or in an initial value: the start of
// the next module item.
bool BeginsModuleItem(K keyword, bool inInitialValue) {
  if (keyword == K::kGenerate || keyword == K::kAssign ||
      VerilogKeywords::Has(keyword, Role::kProcess | Role::kRegion))
    return true;
  if (inInitialValue) return DeclaresNames(keyword) && !NamesDataType(keyword);
  return VerilogKeywords::Has(keyword, Role::kDeclaration);
}

// Besides identifiers, words reserved only by later language versions ("config", "interface")
// may name a port in older code; the words of a port declaration itself never do.
bool CanNamePort(const VerilogToken& token) {
  return token.IsName() || (token.kind == VerilogTokenKind::kKeyword &&
                            !VerilogKeywords::Has(token.keyword, Role::kDeclaration | Role::kStrength));
}

}  // namespace

VerilogModuleParser::VerilogModuleParser(const VerilogPreprocessedText& source, VerilogMessageLog& log)
    : lexer_(source, log), log_(log) {}

std::vector<VerilogModuleInfo> VerilogModuleParser::Parse() {
  Advance();
  bool junkReported = false;  // one message per stretch of text that is no design unit
  while (!token_.IsEnd()) {
    const K keyword = token_.keyword;
    if (keyword == K::kModule || keyword == K::kMacromodule) {
      ParseModule();
      junkReported = false;
    } else if (VerilogKeywords::Has(keyword, Role::kRegion)) {
      SkipRegion();
      junkReported = false;
    } else if (keyword == K::kExtern) {
      Advance();  // an extern module declaration is a header only, without items or endmodule
      if (token_.Is(K::kModule) || token_.Is(K::kMacromodule)) Advance();
      SkipToSemicolon();
    } else if (VerilogKeywords::Has(keyword, Role::kDeclaration)) {
      SkipToSemicolon();
    } else if (keyword == K::kEndmodule) {
      Error(token_, Text::kEndmoduleWithoutModule);
      Advance();
    } else if (token_.IsPunct(';')) {
      Advance();
    } else {
      if (!junkReported) {
        Error(token_, Text::kExpectedModule, Quoted(token_).c_str());
        junkReported = true;
      }
      Advance();
    }
  }
  return std::move(modules_);
}

void VerilogModuleParser::ParseModule() {
  const VerilogToken keyword = token_;
  VerilogModuleInfo module;
  module.line = static_cast<int>(keyword.line);
  Advance();
  if (token_.Is(K::kStatic) || token_.Is(K::kAutomatic)) {
    Advance();
  }
  if (token_.IsName()) {
    module.name = std::string(token_.text);
    Advance();
  } else {
    Error(keyword, Text::kModuleWithoutName, std::string(keyword.text).c_str());
  }
  while (token_.Is(K::kImport)) {
    SkipToSemicolon();
  }
  if (token_.IsPunct('#')) {
    Advance();
    if (token_.IsPunct('(')) SkipGroup('(', ')');
  }
  if (token_.IsPunct('(')) {
    ParsePortList(module);
  }
  if (token_.IsPunct(';')) {
    Advance();
  } else {
    Error(token_, Text::kHeaderWithoutSemicolon, module.name.c_str());
  }
  while (ParseModuleItem(module, 0)) {
  }
  if (token_.Is(K::kEndmodule)) {
    Advance();
    SkipOptionalLabel();
  } else {
    Error(token_, Text::kMissingEndmodule, module.name.c_str());
  }
  if (!module.name.empty()) {
    modules_.push_back(std::move(module));
  }
}

void VerilogModuleParser::ParsePortList(VerilogModuleInfo& module) {
  const VerilogToken open = token_;
  Advance();
  if (token_.IsPunct(')')) {
    module.ports.emplace_back();  // "()": one empty port
    Advance();
    return;
  }
  while (true) {
    module.ports.push_back(ScanPort());
    if (token_.IsPunct(',')) {
      Advance();
    } else if (token_.IsPunct(')')) {
      Advance();
      return;
    } else {
      Error(token_.IsEnd() ? open : token_, Text::kPortListUnterminated, module.name.c_str());
      return;
    }
  }
}

// One entry of a port list, up to its ',' or ')'. Its name: that of ".name(...)"; none for a
// concatenation or an empty entry; otherwise the last identifier outside brackets and before any
// default value, which covers "a", "a[3:0]" and ANSI declarations like "input wire [3:0] a".
std::string VerilogModuleParser::ScanPort() {
  std::string_view name;
  bool named = false;
  if (token_.IsPunct('.')) {
    Advance();
    if (token_.IsName()) {
      name = token_.text;
      named = true;
    }
  } else if (token_.IsPunct('{')) {
    named = true;
  }
  int depth = 0;
  bool afterDefault = false;
  while (!AtBoundary()) {
    if (depth == 0 && (token_.IsPunct(',') || token_.IsPunct(')') || token_.IsPunct(';'))) {
      break;
    }
    if (OpensGroup(token_)) {
      ++depth;
    } else if (ClosesGroup(token_)) {
      depth = depth > 0 ? depth - 1 : 0;
    } else if (depth == 0 && token_.IsPunct('=')) {
      afterDefault = true;
    } else if (depth == 0 && !named && !afterDefault && CanNamePort(token_)) {
      name = token_.text;
    }
    Advance();
  }
  return std::string(name);
}

bool VerilogModuleParser::ParseModuleItem(VerilogModuleInfo& module, int depth) {
  if (AtBoundary()) {
    return false;
  }
  const K keyword = token_.keyword;
  if (keyword == K::kGenerate || keyword == K::kEndgenerate) {
    Advance();
  } else if (keyword == K::kBegin) {
    ParseGenerateBlock(module, depth + 1);
  } else if (keyword == K::kIf) {
    ParseGenerateIf(module, depth + 1);
  } else if (keyword == K::kFor) {
    Advance();
    if (token_.IsPunct('(')) SkipGroup('(', ')');
    ParseGenerateItem(module, depth + 1);
  } else if (IsCaseKeyword(keyword)) {
    ParseGenerateCase(module, depth + 1);
  } else if (VerilogKeywords::Has(keyword, Role::kProcess)) {
    Advance();
    SkipStatement(depth + 1);
  } else if (VerilogKeywords::Has(keyword, Role::kRegion)) {
    SkipRegion();
  } else if (DeclaresNames(keyword)) {
    SkipDeclaration();
  } else if (VerilogKeywords::Has(keyword, Role::kDeclaration)) {
    SkipToSemicolon();
  } else if (token_.IsName()) {
    ParseInstances(module);
  } else if (token_.IsPunct(';')) {
    Advance();
  } else if (VerilogKeywords::Has(keyword, Role::kCloser) || keyword == K::kElse) {
    Error(token_, Text::kUnexpectedToken, Quoted(token_).c_str());
    Advance();
  } else {
    Error(token_, Text::kUnexpectedToken, Quoted(token_).c_str());
    SkipToSemicolon();
  }
  return true;
}

void VerilogModuleParser::ParseGenerateItem(VerilogModuleInfo& module, int depth) {
  if (TooDeep(depth)) {
    SkipFlat();
  } else if (token_.Is(K::kBegin)) {
    ParseGenerateBlock(module, depth + 1);
  } else {
    ParseModuleItem(module, depth);
  }
}

void VerilogModuleParser::ParseGenerateBlock(VerilogModuleInfo& module, int depth) {
  const VerilogToken begin = token_;
  if (TooDeep(depth)) {
    SkipKeywordBlock();
    return;
  }
  Advance();
  SkipOptionalLabel();
  while (!token_.Is(K::kEnd)) {
    if (!ParseModuleItem(module, depth)) {
      Error(begin, Text::kMissingBlockEnd, "begin", "end");
      return;
    }
  }
  Advance();
  SkipOptionalLabel();
}

void VerilogModuleParser::ParseGenerateIf(VerilogModuleInfo& module, int depth) {
  Advance();
  if (token_.IsPunct('(')) SkipGroup('(', ')');
  ParseGenerateItem(module, depth);
  // An else-if chain is handled here rather than by nesting, so a long chain costs no depth.
  while (token_.Is(K::kElse)) {
    Advance();
    if (!token_.Is(K::kIf)) {
      ParseGenerateItem(module, depth);
      return;
    }
    Advance();
    if (token_.IsPunct('(')) SkipGroup('(', ')');
    ParseGenerateItem(module, depth);
  }
}

void VerilogModuleParser::ParseGenerateCase(VerilogModuleInfo& module, int depth) {
  const VerilogToken keyword = token_;
  Advance();
  if (token_.IsPunct('(')) SkipGroup('(', ')');
  while (!token_.Is(K::kEndcase)) {
    if (AtBoundary()) {
      Error(keyword, Text::kMissingBlockEnd, std::string(keyword.text).c_str(), "endcase");
      return;
    }
    SkipCaseLabel();
    ParseGenerateItem(module, depth);
  }
  Advance();
}

// At a name: the type of module instances "type [#(...)] name [range] (...), ... ;", or a
// statement that only looks similar, which is skipped.
void VerilogModuleParser::ParseInstances(VerilogModuleInfo& module) {
  const VerilogToken type = token_;
  Advance();
  if (token_.IsPunct('#')) {
    Advance();
    if (token_.IsPunct('(')) {
      SkipGroup('(', ')');
    } else if (!AtBoundary() && !token_.IsPunct(';')) {
      Advance();  // #8, #WIDTH
    }
  }
  if (token_.IsPunct('(') && !SkipDriveStrength()) {
    SkipToSemicolon();  // a primitive instance without a name, or no instance at all
    return;
  }
  for (bool first = true;; first = false) {
    if (!token_.IsName()) {
      if (!first) Error(token_, Text::kInstanceNameExpected, std::string(type.text).c_str());
      SkipToSemicolon();
      return;
    }
    const VerilogToken name = token_;
    Advance();
    while (token_.IsPunct('[')) {
      SkipGroup('[', ']');
    }
    if (!token_.IsPunct('(')) {
      // "type name;" or "type name = ...;" declares something of a user-defined type
      if (!first) Error(token_, Text::kInstanceConnectionsExpected, std::string(name.text).c_str());
      SkipToSemicolon();
      return;
    }
    SkipGroup('(', ')');
    module.instances.push_back({std::string(type.text), std::string(name.text), static_cast<int>(name.line)});
    if (token_.IsPunct(',')) {
      Advance();
    } else if (token_.IsPunct(';')) {
      Advance();
      return;
    } else {
      Error(token_, Text::kInstanceSeparatorExpected, std::string(name.text).c_str());
      if (token_.kind != VerilogTokenKind::kIdentifier && token_.kind != VerilogTokenKind::kKeyword) {
        SkipToSemicolon();  // a name or keyword most likely starts the next statement
      }
      return;
    }
  }
}

// At '(' after a primitive's type: skips a drive strength "(strong0, weak1)" and a delay after it.
// False, with nothing skipped, when the parentheses hold no drive strength.
bool VerilogModuleParser::SkipDriveStrength() {
  const VerilogLexer::Position mark = lexer_.Mark();
  const VerilogToken open = token_;
  Advance();
  const bool strength = VerilogKeywords::Has(token_.keyword, Role::kStrength);
  lexer_.Reset(mark);
  token_ = open;
  if (!strength) {
    return false;
  }
  SkipGroup('(', ')');
  if (token_.IsPunct('#')) {
    Advance();
    if (token_.IsPunct('(')) {
      SkipGroup('(', ')');
    } else if (!AtBoundary()) {
      Advance();
    }
  }
  return true;
}

void VerilogModuleParser::SkipStatement(int depth) {
  if (AtBoundary()) {
    return;
  }
  if (TooDeep(depth)) {
    SkipFlat();
    return;
  }
  const K keyword = token_.keyword;
  if (OpensKeywordBlock(keyword)) {
    SkipKeywordBlock();
  } else if (keyword == K::kIf) {
    Advance();
    if (token_.IsPunct('(')) SkipGroup('(', ')');
    SkipStatement(depth + 1);
    while (token_.Is(K::kElse)) {
      Advance();
      if (!token_.Is(K::kIf)) {
        SkipStatement(depth + 1);
        return;
      }
      Advance();
      if (token_.IsPunct('(')) SkipGroup('(', ')');
      SkipStatement(depth + 1);
    }
  } else if (keyword == K::kFor || keyword == K::kWhile || keyword == K::kRepeat || keyword == K::kForeach ||
             keyword == K::kWait) {
    Advance();
    if (token_.IsPunct('(')) SkipGroup('(', ')');
    SkipStatement(depth + 1);
  } else if (keyword == K::kForever) {
    Advance();
    SkipStatement(depth + 1);
  } else if (keyword == K::kDo) {
    Advance();
    SkipStatement(depth + 1);
    if (token_.Is(K::kWhile)) SkipToSemicolon();
  } else if (token_.IsPunct('@')) {
    SkipEventControl();
    SkipStatement(depth + 1);
  } else if (token_.IsPunct('#')) {
    Advance();
    if (token_.IsPunct('(')) {
      SkipGroup('(', ')');
    } else if (!AtBoundary()) {
      Advance();
    }
    SkipStatement(depth + 1);
  } else if (token_.IsPunct(';')) {
    Advance();
  } else {
    SkipToSemicolon();
  }
}

// "@(...)", "@*", "@(*)" or "@name" / "@a.b".
void VerilogModuleParser::SkipEventControl() {
  Advance();
  if (token_.IsPunct('(')) {
    SkipGroup('(', ')');
  } else if (token_.IsPunct('*')) {
    Advance();
  } else if (token_.IsName()) {
    Advance();
    while (token_.IsPunct('.')) {
      Advance();
      if (token_.IsName()) Advance();
    }
  }
}

// begin...end, fork...join or case...endcase, with whatever they nest.
void VerilogModuleParser::SkipKeywordBlock() {
  const VerilogToken open = token_;
  const K keyword = open.keyword;
  auto opens = [keyword](K k) {
    return keyword == K::kBegin ? k == K::kBegin : keyword == K::kFork ? k == K::kFork : IsCaseKeyword(k);
  };
  auto closes = [keyword](K k) {
    return keyword == K::kBegin ? k == K::kEnd : keyword == K::kFork ? IsJoinKeyword(k) : k == K::kEndcase;
  };
  long depth = 0;
  while (!AtBoundary()) {
    const K current = token_.keyword;
    Advance();
    if (opens(current)) {
      ++depth;
    } else if (closes(current) && --depth == 0) {
      SkipOptionalLabel();
      return;
    }
  }
  Error(open, Text::kMissingBlockEnd, std::string(open.text).c_str(),
        keyword == K::kBegin  ? "end"
        : keyword == K::kFork ? "join"
                              : "endcase");
}

// A region like function...endfunction or primitive...endprimitive, skipped whole.
void VerilogModuleParser::SkipRegion() {
  const VerilogToken open = token_;
  const K closing = VerilogKeywords::ClosingOf(open.keyword);
  Advance();
  if (open.Is(K::kPrimitive) && token_.IsName()) {
    primitives_.emplace_back(token_.text);
  }
  while (!token_.Is(closing)) {
    if (AtBoundary()) {
      Error(open, Text::kMissingBlockEnd, std::string(open.text).c_str(),
            std::string(VerilogKeywords::TextOf(closing)).c_str());
      return;
    }
    Advance();
  }
  Advance();
  SkipOptionalLabel();
}

// At `open`: up to and including the matching `close`. A unit boundary inside ends the group
// early with a message, so that one missing parenthesis cannot swallow the modules after it.
void VerilogModuleParser::SkipGroup(char open, char close) {
  const VerilogToken start = token_;
  long depth = 0;
  while (!AtBoundary()) {
    if (token_.IsPunct(open)) {
      ++depth;
    } else if (token_.IsPunct(close) && --depth == 0) {
      Advance();
      return;
    }
    Advance();
  }
  Error(start, Text::kUnbalanced, open, close);
}

// Up to and including the ';' of a declaration. Where the ';' is missing ("wire w" and the next
// item on the next line), the next item shows it: a name followed by '(' or by a keyword that
// begins an item, or the end of the module, while the declaration still lists names. The error
// names the declared name, and parsing goes on from the name after it.
void VerilogModuleParser::SkipDeclaration() {
  VerilogToken last = token_;
  Advance();
  long depth = 0;
  bool inInitialValue = false;  // after '=' up to the next ',' at the top
  bool afterName = false;
  VerilogToken declared;
  std::optional<std::pair<VerilogLexer::Position, VerilogToken>> nextItem;
  for (;;) {
    const bool top = depth == 0;
    if (AtBoundary() || (top && VerilogKeywords::Has(token_.keyword, Role::kCloser))) {
      Error(last, Text::kDeclarationWithoutSemicolon, Quoted(last).c_str());
      return;
    }
    if (top && token_.IsPunct(';')) {
      Advance();
      return;
    }
    if (top && inInitialValue && BeginsModuleItem(token_.keyword, true)) {
      Error(last, Text::kDeclarationWithoutSemicolon, Quoted(last).c_str());
      return;
    }
    if (top && afterName && (token_.IsPunct('(') || BeginsModuleItem(token_.keyword, false))) {
      Error(declared, Text::kDeclarationWithoutSemicolon, Quoted(declared).c_str());
      if (token_.IsPunct('(') && nextItem) {
        lexer_.Reset(nextItem->first);
        token_ = nextItem->second;
      }
      return;
    }
    const bool name = top && !inInitialValue && token_.IsName();
    if (name && !afterName) {
      declared = token_;
      nextItem.reset();
    } else if (name && !nextItem) {
      nextItem.emplace(lexer_.Mark(), token_);
    }
    afterName = name;
    if (OpensGroup(token_)) {
      ++depth;
    } else if (ClosesGroup(token_)) {
      depth = depth > 0 ? depth - 1 : 0;
    } else if (top && token_.IsPunct('=')) {
      inInitialValue = true;
    } else if (top && token_.IsPunct(',')) {
      inInitialValue = false;
    }
    last = token_;
    Advance();
  }
}

// Up to and including the next ';' outside brackets and blocks. Stops before a unit boundary, and
// before a block's closing keyword that belongs to an enclosing block; consumes at least one token
// otherwise, so that every caller makes progress.
void VerilogModuleParser::SkipToSemicolon() {
  long depth = 0;
  for (bool first = true; !AtBoundary(); first = false) {
    const K keyword = token_.keyword;
    if (depth == 0 && token_.IsPunct(';')) {
      Advance();
      return;
    }
    if (OpensGroup(token_) || OpensKeywordBlock(keyword)) {
      ++depth;
    } else if (ClosesGroup(token_)) {
      depth = depth > 0 ? depth - 1 : 0;
    } else if (VerilogKeywords::Has(keyword, Role::kCloser)) {
      if (depth > 0 && ClosesKeywordBlock(keyword) && --depth == 0) {
        Advance();  // a statement that ends in a block, like "... else begin ... end"
        SkipOptionalLabel();
        return;
      }
      if (depth == 0 && !first) {
        return;
      }
    }
    Advance();
  }
}

void VerilogModuleParser::SkipFlat() {
  if (OpensKeywordBlock(token_.keyword)) {
    SkipKeywordBlock();
  } else {
    SkipToSemicolon();
  }
}

// A generate case label: "expr, expr :" or "default [:]".
void VerilogModuleParser::SkipCaseLabel() {
  if (token_.Is(K::kDefault)) {
    Advance();
    if (token_.IsPunct(':')) Advance();
    return;
  }
  long depth = 0;
  while (!AtBoundary() && !token_.Is(K::kEndcase)) {
    if (depth == 0 && token_.IsPunct(':')) {
      Advance();
      return;
    }
    if (OpensGroup(token_)) {
      ++depth;
    } else if (ClosesGroup(token_)) {
      depth = depth > 0 ? depth - 1 : 0;
    }
    Advance();
  }
}

void VerilogModuleParser::SkipOptionalLabel() {
  if (token_.IsPunct(':')) {
    Advance();
    if (token_.IsName()) Advance();
  }
}

bool VerilogModuleParser::TooDeep(int depth) {
  if (depth < kMaxNesting) {
    return false;
  }
  if (!nestingReported_) {
    Error(token_, Text::kNestingTooDeep, kMaxNesting);
    nestingReported_ = true;
  }
  return true;
}

void VerilogModuleParser::Error(const VerilogToken& at, const char* format, ...) {
  if (log_.Full()) {
    return;
  }
  std::va_list args;
  va_start(args, format);
  log_.ReportV(VerilogSeverity::kError, lexer_.FileName(at.fileId), static_cast<int>(at.line), format, args);
  va_end(args);
}

}  // namespace Hx_Vci
