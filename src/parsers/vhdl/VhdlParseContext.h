// What the VHDL scanner and grammar share during one parse of one file: the holder they record
// into, the line counter, the scanner's flags and the texts of the grammar's symbols.
#pragma once

#include <cstddef>
#include <cstdint>
#include <initializer_list>
#include <set>
#include <string>
#include <string_view>

#include "Port/StringBase.h"
#include "VhdlStructure.h"

namespace Port {
class Stream;
}

namespace Vad {

class CParserConfigHolder;

// The semantic value of every grammar symbol: a text in the parse's VhdlTextStore.
struct VhdlText {
  std::uint32_t offset;
  std::uint32_t length;
};

// The texts that grammar symbols carry. A symbol's value is an offset into one growing buffer,
// so shifting a token copies eight bytes rather than a string.
class VhdlTextStore {
 public:
  static constexpr std::size_t kMaxLength = 1999;

  // Stores the text, cut to kMaxLength characters.
  VhdlText Add(std::string_view text) {
    text = text.substr(0, kMaxLength);
    VhdlText stored{static_cast<std::uint32_t>(buffer_.size()), static_cast<std::uint32_t>(text.size())};
    buffer_.append(text);
    return stored;
  }

  // Stores the concatenation of the pieces, cut to kMaxLength characters. Pieces may be texts of
  // this store.
  VhdlText Join(std::initializer_list<std::string_view> pieces) {
    std::string joined;
    for (std::string_view piece : pieces) joined.append(piece);
    return Add(joined);
  }

  std::string_view View(VhdlText text) const {
    return std::string_view(buffer_).substr(text.offset, text.length);
  }
  Port::StringBase String(VhdlText text) const { return Port::StringBase(View(text)); }

  // Drops every text but `kept`, which moves to the start of the store. The grammar calls this
  // once a construct is complete, when no other text is still referenced.
  void KeepOnly(VhdlText& kept) {
    if (kept.length != 0 && kept.offset + kept.length <= buffer_.size()) {
      buffer_.erase(0, kept.offset);
      buffer_.resize(kept.length);
    } else {
      buffer_.clear();
      kept.length = 0;
    }
    kept.offset = 0;
  }
  void Clear() { buffer_.clear(); }

  std::size_t Size() const { return buffer_.size(); }

 private:
  std::string buffer_;
};

// The declaration whose end the grammar looks for: a context declaration holds only context
// items, a configuration nests block and component configurations that each end with "end for".
enum class VhdlDeclaration { kNone, kContext, kConfiguration };

struct VhdlParseContext {
  VhdlParseContext(CParserConfigHolder& recorder, Port::Stream& source, bool synthesisTarget)
      : holder(recorder), input(source), synthesis(synthesisTarget) {}

  CParserConfigHolder& holder;
  Port::Stream& input;
  // Counts every newline the scanner consumes, in any state.
  std::uint32_t line = 1;
  // Translate pragmas are honoured only when the parse target is synthesis.
  bool synthesis = false;
  // True after "begin", false after an architecture header: a use clause in a body waits for the
  // next unit.
  bool begin = true;
  // True while nothing but blanks followed "--" on this comment (or, in switched-off code, since
  // the line began).
  bool pragma = false;
  std::uint32_t commentCount = 0;
  // True while the grammar waits for the first token of a construct; the table tells, by token
  // code, which tokens can begin one (see VhdlTokensBeginningConstructs).
  bool betweenConstructs = false;
  const bool* tokenBeginsConstruct = nullptr;
  // A name read between constructs that goes to the grammar only if a colon follows.
  bool holdsName = false;
  VhdlText heldName{0, 0};
  VhdlTextStore texts;

  // The last token scanned and the one before it, dropped ones included (0 before the first).
  int lastToken = 0;
  int tokenBeforeLast = 0;
  // Open parentheses; a label inside them names an interface object, not an instance.
  std::uint32_t parenDepth = 0;
  // Between "record" and the next "end": element declarations look like instances.
  bool inRecord = false;
  // Between the two words "process" of a process statement: no instance can stand there.
  bool inProcess = false;
  // Set as a held name goes to the grammar before a colon: whether it stands where a concurrent
  // statement begins (after ";", "begin", "generate" or "=>", outside parentheses, records and
  // processes).
  bool labelBeginsStatement = false;
  bool heldNameBeginsStatement = false;
  // The line of the package header being read.
  std::uint32_t unitLine = 1;
  VhdlDeclaration openDeclaration = VhdlDeclaration::kNone;
  // Block and component configurations open inside the configuration.
  std::uint32_t configurationDepth = 0;
  std::string configuredEntity;
  bool awaitsConfiguredArchitecture = false;
  // The generic map of a package instance: its actuals may name package instances, which the
  // instance then uses. Read by the scanner, token by token, after the grammar saw the header.
  enum class Actuals { kNone, kAwaitingMap, kReading };
  Actuals actuals = Actuals::kNone;
  std::uint32_t actualsDepth = 0;  // the parentheses open outside the map
  bool readingActual = false;      // since "=>": a selected name so far
  bool actualWantsName = false;
  std::string actual;
  // The libraries of this file's library clauses, in lower case: "lib.name" in a generic map
  // names a unit only when lib is one of them or work.
  std::set<std::string> libraries;
  // The line of the "for" of the configuration item being read: a block configuration is reduced
  // only after the token that follows it.
  std::uint32_t forLine = 1;
  // The nesting of the file, for the first syntax error that recovery would pass over.
  VhdlStructure structure;
};

// Records the selected name of a generic map's actual as a use of the unit being declared when
// it names a unit of a library (see VhdlParseContext::libraries).
void RecordGenericActual(VhdlParseContext& context, std::string_view name);

// Runs the scanner and grammar over the context's input until the end of input, a parse-stack
// overflow, or memory running out. False only in that last case. What was recorded before stays
// recorded.
bool RunVhdlGrammar(VhdlParseContext& context);

}  // namespace Vad
