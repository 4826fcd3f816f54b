#include "VhdlStructure.h"

#include <array>
#include <span>
#include <utility>

namespace Vad {

namespace {

constexpr std::size_t kLongestKnownWord = 13;  // "configuration"

}  // namespace

std::span<const std::pair<std::string_view, VhdlStructure::Word>> VhdlStructure::KnownWords() {
  static constexpr std::pair<std::string_view, Word> kWords[] = {
      {"end", Word::kEnd},
      {"begin", Word::kBegin},
      {"is", Word::kIs},
      {"new", Word::kNew},
      {"use", Word::kUse},
      {"then", Word::kThen},
      {"elsif", Word::kElsif},
      {"else", Word::kElse},
      {"for", Word::kFor},
      {"body", Word::kBody},
      {"postponed", Word::kPostponed},
      {"entity", Word::kEntity},
      {"architecture", Word::kArchitecture},
      {"package", Word::kPackage},
      {"configuration", Word::kConfiguration},
      {"context", Word::kContext},
      {"process", Word::kProcess},
      {"block", Word::kBlock},
      {"if", Word::kIf},
      {"case", Word::kCase},
      {"loop", Word::kLoop},
      {"generate", Word::kGenerate},
      {"record", Word::kRecord},
      {"units", Word::kUnits},
      {"protected", Word::kProtected},
      {"component", Word::kComponent},
      {"function", Word::kFunction},
      {"procedure", Word::kProcedure},
  };
  return kWords;
}

VhdlStructure::Word VhdlStructure::Classify(std::string_view text) {
  // The other reserved words of VHDL-2008 that can stand before a character literal.
  static constexpr std::string_view kReserved[] = {
      "abs",       "after", "all",  "and",    "assert",   "downto", "in",     "inertial", "mod",   "nand",
      "nor",       "not",   "null", "of",     "on",       "or",     "others", "range",    "rem",   "report",
      "return",    "rol",   "ror",  "select", "severity", "sla",    "sll",    "sra",      "srl",   "to",
      "transport", "until", "wait", "when",   "while",    "with",   "xnor",   "xor",      "force", "reject",
  };
  if (text.empty() || text.size() > kLongestKnownWord || text[0] == '\\') return Word::kName;
  std::array<char, kLongestKnownWord> buffer{};
  for (std::size_t i = 0; i < text.size(); ++i) {
    char c = text[i];
    buffer[i] = (c >= 'A' && c <= 'Z') ? static_cast<char>(c - 'A' + 'a') : c;
  }
  const std::string_view lower(buffer.data(), text.size());
  for (const auto& [spelling, word] : KnownWords()) {
    if (spelling == lower) return word;
  }
  for (std::string_view spelling : kReserved) {
    if (spelling == lower) return Word::kReserved;
  }
  return Word::kName;
}

const char* VhdlStructure::NameOf(Construct construct) {
  switch (construct) {
    case Construct::kEntity:
      return "entity";
    case Construct::kArchitecture:
      return "architecture";
    case Construct::kPackage:
      return "package";
    case Construct::kConfiguration:
      return "configuration";
    case Construct::kContext:
      return "context";
    case Construct::kProcess:
      return "process";
    case Construct::kBlock:
      return "block";
    case Construct::kIf:
      return "if statement";
    case Construct::kCase:
      return "case statement";
    case Construct::kLoop:
      return "loop";
    case Construct::kGenerate:
      return "generate statement";
    case Construct::kRecord:
      return "record type";
    case Construct::kUnits:
      return "physical type";
    case Construct::kProtected:
      return "protected type";
    case Construct::kComponent:
      return "component declaration";
    case Construct::kSubprogram:
      return "subprogram body";
    case Construct::kBlockConfiguration:
      return "block or component configuration";
  }
  return "construct";
}

// The construct that "end WORD" names, if WORD names one.
std::optional<VhdlStructure::Construct> VhdlStructure::ClosedBy(Word word) {
  switch (word) {
    case Word::kEntity:
      return Construct::kEntity;
    case Word::kArchitecture:
      return Construct::kArchitecture;
    case Word::kPackage:
      return Construct::kPackage;
    case Word::kConfiguration:
      return Construct::kConfiguration;
    case Word::kContext:
      return Construct::kContext;
    case Word::kProcess:
    case Word::kPostponed:
      return Construct::kProcess;
    case Word::kBlock:
      return Construct::kBlock;
    case Word::kIf:
      return Construct::kIf;
    case Word::kCase:
      return Construct::kCase;
    case Word::kLoop:
      return Construct::kLoop;
    case Word::kGenerate:
      return Construct::kGenerate;
    case Word::kRecord:
      return Construct::kRecord;
    case Word::kUnits:
      return Construct::kUnits;
    case Word::kProtected:
      return Construct::kProtected;
    case Word::kComponent:
      return Construct::kComponent;
    case Word::kFunction:
    case Word::kProcedure:
      return Construct::kSubprogram;
    default:
      return std::nullopt;
  }
}

void VhdlStructure::Note(Token token, std::string_view text, std::uint32_t line) {
  const Word word = token == Token::kWord ? Classify(text) : Word::kNone;
  if (checking_ && !fault_) Follow(token, word, line);
  lastToken_ = token;
  lastWord_ = word;
  lastEndsName_ = token == Token::kCloseParen || word == Word::kName;
}

void VhdlStructure::NoteUnterminated(std::string_view what, std::uint32_t line) {
  if (checking_ && !fault_) Report(line, std::string(what) + " is not closed on its line");
}

void VhdlStructure::Finish() {
  if (!checking_ || fault_) return;
  if (parenDepth_ > 0) {
    Report(parenLine_, "'(' is not closed by ')' before the end of the file");
  } else if (afterEnd_ || inEndTail_) {
    Report(endLine_, "';' expected after 'end' before the end of the file");
  } else if (!open_.empty()) {
    Report(open_.back().line, std::string("this ") + NameOf(open_.back().construct) +
                                  " is not closed by 'end' before the end of the file");
  }
}

void VhdlStructure::Follow(Token token, Word word, std::uint32_t line) {
  if (token == Token::kOpenParen) {
    if (parenDepth_++ == 0) parenLine_ = line;
  } else if (token == Token::kCloseParen) {
    if (parenDepth_ == 0) return Report(line, "')' without '('");
    --parenDepth_;
  }
  if (afterEnd_ || inEndTail_) return NoteEndTail(token, word, line);
  if (pending_) ResolvePending(token, word);
  if (token == Token::kSemicolon && parenDepth_ == 0) inAlternative_ = false;
  if (token == Token::kWord) NoteWord(word, line);
}

void VhdlStructure::NoteWord(Word word, std::uint32_t line) {
  if (parenDepth_ > 0) {
    if (word == Word::kEnd || word == Word::kBegin)
      Report(line, "'(' of line " + std::to_string(parenLine_) + " is not closed by ')'");
    return;  // nothing opens inside parentheses
  }
  // After a colon these words name an entity class or an instantiated unit; after "use", the
  // unit of a binding.
  const bool named = lastToken_ == Token::kColon || lastWord_ == Word::kUse;
  switch (word) {
    case Word::kEnd:
      afterEnd_ = true;
      endLine_ = line;
      break;
    case Word::kEntity:
      if (!named) OpenLibraryUnit(Construct::kEntity, line);
      break;
    case Word::kArchitecture:
      if (!named) OpenLibraryUnit(Construct::kArchitecture, line);
      break;
    case Word::kConfiguration:
      if (!named) OpenLibraryUnit(Construct::kConfiguration, line);
      break;
    case Word::kContext:
      if (!named) pending_ = Pending{Construct::kContext, line};
      break;
    case Word::kPackage:
      if (!named) pending_ = Pending{Construct::kPackage, line};
      break;
    case Word::kFunction:
    case Word::kProcedure:
      if (!named) pending_ = Pending{Construct::kSubprogram, line};
      break;
    case Word::kComponent:
      if (!named) OpenConstruct(Construct::kComponent, line);
      break;
    case Word::kProcess:
      OpenConstruct(Construct::kProcess, line);
      break;
    case Word::kBlock:
      OpenConstruct(Construct::kBlock, line);
      break;
    case Word::kRecord:
      OpenConstruct(Construct::kRecord, line);
      break;
    case Word::kUnits:
      OpenConstruct(Construct::kUnits, line);
      break;
    case Word::kProtected:
      OpenConstruct(Construct::kProtected, line);
      break;
    case Word::kLoop:
      OpenConstruct(Construct::kLoop, line);
      break;
    case Word::kIf:
      OpenConstruct(Construct::kIf, line);
      open_.back().awaitsKind = true;
      break;
    case Word::kCase:
      OpenConstruct(Construct::kCase, line);
      open_.back().awaitsKind = true;
      break;
    case Word::kThen:
      inAlternative_ = false;
      if (!open_.empty()) open_.back().awaitsKind = false;
      break;
    case Word::kIs:
      if (!open_.empty() && open_.back().construct == Construct::kCase) open_.back().awaitsKind = false;
      break;
    case Word::kElsif:
    case Word::kElse:
      inAlternative_ = true;
      break;
    case Word::kGenerate:
      OpenGenerate(line);
      break;
    case Word::kFor:
      if (InsideConfiguration()) OpenConstruct(Construct::kBlockConfiguration, line);
      break;
    default:
      break;
  }
}

// "package p is new ...", "function f is new ..." instantiate; "context lib.c;" and a
// subprogram declaration end at their ";". Only a header whose "is" is followed by anything but
// "new" opens a construct.
void VhdlStructure::ResolvePending(Token token, Word word) {
  Pending& pending = *pending_;
  if (!pending.sawIs) {
    if (parenDepth_ > 0) return;
    if (word == Word::kIs) {
      pending.sawIs = true;
    } else if (token == Token::kSemicolon) {
      pending_.reset();
    }
    return;
  }
  const Pending decided = pending;
  pending_.reset();
  if (word == Word::kNew) return;
  if (decided.construct == Construct::kContext) {
    OpenLibraryUnit(decided.construct, decided.line);
  } else {
    OpenConstruct(decided.construct, decided.line);
  }
}

// The word after "end" says what it closes; the rest up to ";" may only repeat the name.
void VhdlStructure::NoteEndTail(Token token, Word word, std::uint32_t line) {
  if (afterEnd_) {
    afterEnd_ = false;
    CloseWith(word, line);
    if (fault_) return;
    inEndTail_ = !(token == Token::kSemicolon && parenDepth_ == 0);
    return;
  }
  if (token == Token::kSemicolon && parenDepth_ == 0) {
    inEndTail_ = false;
    return;
  }
  // "end package body p", "end postponed process p", "end function "+"".
  const bool mayFollow =
      token == Token::kLiteral ||
      (token == Token::kWord && (word == Word::kName || word == Word::kBody || word == Word::kProcess));
  if (!mayFollow) Report(line, "';' expected after the 'end' of line " + std::to_string(endLine_));
}

void VhdlStructure::CloseWith(Word word, std::uint32_t line) {
  // A VHDL-2008 configuration specification may end with "end for;" too.
  if (word == Word::kFor) {
    if (!open_.empty() && open_.back().construct == Construct::kBlockConfiguration) open_.pop_back();
    return;
  }
  if (open_.empty()) return Report(line, "'end' without a construct to close");
  const Open& top = open_.back();
  const std::optional<Construct> named = ClosedBy(word);
  // In VHDL-2008 an alternative of a generate statement may end with "end [label];".
  if (top.construct == Construct::kGenerate && !named) return;
  if (named && *named != top.construct) {
    return Report(line, "'end " + std::string(WordText(word)) + "' does not close the " +
                            NameOf(top.construct) + " of line " + std::to_string(top.line));
  }
  open_.pop_back();
}

void VhdlStructure::OpenConstruct(Construct construct, std::uint32_t line) {
  open_.push_back(Open{construct, line});
}

// Entities, architectures, configurations and context declarations stand only at the top of a
// file.
void VhdlStructure::OpenLibraryUnit(Construct construct, std::uint32_t line) {
  if (!open_.empty()) {
    const Open& unclosed = open_.back();
    return Report(line, std::string("the ") + NameOf(unclosed.construct) + " of line " +
                            std::to_string(unclosed.line) + " is not closed by 'end' before this " +
                            NameOf(construct));
  }
  OpenConstruct(construct, line);
}

void VhdlStructure::OpenGenerate(std::uint32_t line) {
  if (inAlternative_) {  // "elsif c generate", "else generate": a branch of the open one
    inAlternative_ = false;
    return;
  }
  if (!open_.empty() && open_.back().awaitsKind) {  // "if c generate", "case e generate"
    open_.back().construct = Construct::kGenerate;
    open_.back().awaitsKind = false;
    return;
  }
  OpenConstruct(Construct::kGenerate, line);
}

bool VhdlStructure::InsideConfiguration() const {
  return !open_.empty() && open_.front().construct == Construct::kConfiguration;
}

std::string_view VhdlStructure::WordText(Word word) {
  for (const auto& [spelling, known] : KnownWords()) {
    if (known == word) return spelling;
  }
  return {};
}

void VhdlStructure::Report(std::uint32_t line, std::string text) {
  if (!fault_) fault_ = Fault{line, std::move(text)};
}

}  // namespace Vad
