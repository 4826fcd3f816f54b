// Follows the nesting of a VHDL file token by token, beside the partial grammar (which recovers
// from everything it does not read), and keeps the first place where the text cannot be legal
// VHDL: a parenthesis, string or extended identifier left open, a construct that no "end"
// closes, an "end" too many or of the wrong kind, a library unit begun inside another.
//
// It knows only the words that open and close constructs, so it stays quiet on whatever else is
// wrong; it never reports legal VHDL-93 or VHDL-2008 (PSL aside).
#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace Vad {

class VhdlStructure {
 public:
  enum class Token { kWord, kOpenParen, kCloseParen, kSemicolon, kColon, kLiteral, kOther };

  struct Fault {
    std::uint32_t line = 0;
    std::string text;
  };

  // A token in file order; `word` is the text of a kWord (keyword, name, number or extended
  // identifier), ignored otherwise.
  void Note(Token token, std::string_view word, std::uint32_t line);
  // A string or extended identifier without its closing character on its line.
  void NoteUnterminated(std::string_view what, std::uint32_t line);
  // Code switched off by a translate pragma need not be nested as the rest is: nothing is
  // checked from here on.
  void StopChecking() { checking_ = false; }
  // The end of the input.
  void Finish();

  // Whether the last token ends a name, so that an apostrophe after it is a tick, not the start
  // of a character literal.
  bool LastTokenEndsName() const { return lastEndsName_; }

  const std::optional<Fault>& FirstFault() const { return fault_; }

 private:
  enum class Construct {
    kEntity,
    kArchitecture,
    kPackage,
    kConfiguration,
    kContext,
    kProcess,
    kBlock,
    kIf,
    kCase,
    kLoop,
    kGenerate,
    kRecord,
    kUnits,
    kProtected,
    kComponent,
    kSubprogram,
    kBlockConfiguration,
  };
  // The words that matter here; every other reserved word is kReserved, anything else a name.
  enum class Word {
    kNone,
    kName,
    kReserved,
    kEnd,
    kBegin,
    kIs,
    kNew,
    kUse,
    kThen,
    kElsif,
    kElse,
    kFor,
    kBody,
    kPostponed,
    kEntity,
    kArchitecture,
    kPackage,
    kConfiguration,
    kContext,
    kProcess,
    kBlock,
    kIf,
    kCase,
    kLoop,
    kGenerate,
    kRecord,
    kUnits,
    kProtected,
    kComponent,
    kFunction,
    kProcedure,
  };
  struct Open {
    Construct construct;
    std::uint32_t line;
    // An "if" or "case" whose "then", "is" or "generate" is still to come.
    bool awaitsKind = false;
  };
  // A header that opens a construct only if it turns out to be a body or a declaration rather
  // than an instance or a reference: decided by the token after its "is".
  struct Pending {
    Construct construct;
    std::uint32_t line;
    bool sawIs = false;
  };

  static std::span<const std::pair<std::string_view, Word>> KnownWords();
  static Word Classify(std::string_view word);
  static std::string_view WordText(Word word);
  static const char* NameOf(Construct construct);
  static std::optional<Construct> ClosedBy(Word word);

  void Follow(Token token, Word word, std::uint32_t line);
  void NoteWord(Word word, std::uint32_t line);
  void NoteEndTail(Token token, Word word, std::uint32_t line);
  void CloseWith(Word word, std::uint32_t line);
  void ResolvePending(Token token, Word word);
  void OpenConstruct(Construct construct, std::uint32_t line);
  void OpenLibraryUnit(Construct construct, std::uint32_t line);
  void OpenGenerate(std::uint32_t line);
  bool InsideConfiguration() const;
  void Report(std::uint32_t line, std::string text);

  std::vector<Open> open_;
  std::optional<Pending> pending_;
  std::uint32_t parenDepth_ = 0;
  std::uint32_t parenLine_ = 0;  // of the outermost open parenthesis
  // After "end": the word after it is still to be seen, then the rest up to ";".
  bool afterEnd_ = false;
  bool inEndTail_ = false;
  std::uint32_t endLine_ = 0;
  // Since "elsif" or a lone "else": a "generate" ends an alternative of an if-generate.
  bool inAlternative_ = false;
  Token lastToken_ = Token::kOther;
  Word lastWord_ = Word::kNone;
  bool lastEndsName_ = false;
  bool checking_ = true;
  std::optional<Fault> fault_;
};

}  // namespace Vad
