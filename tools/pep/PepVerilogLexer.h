// Splits Verilog text into tokens. Comments, attributes (* ... *) and white space are dropped;
// escaped identifiers come without their backslash. Compiler directives are read through rather
// than obeyed: `define, `include, `timescale and the like are dropped with the rest of their line,
// `ifdef/`ifndef/`elsif with their macro name and `else/`endif alone, so every branch of a
// conditional is read; any other `NAME is a kMacro token (its value stays unknown).
// Unterminated strings end at the end of the line, unterminated comments at the end of the text.
#pragma once

#include <string_view>

#include "pep/PepLexer.h"
#include "pep/PepTextCursor.h"

class PepVerilogLexer : public PepLexer {
 public:
  // `text` must outlive the lexer.
  explicit PepVerilogLexer(std::string_view text) : cursor_(text) {}

  PepToken Next() override;

 private:
  void SkipBlanksCommentsAndAttributes();
  bool StartsAttribute() const;
  // Drops a directive that is read through; false when the directive is a macro use.
  bool SkipDirective(std::string_view name);
  void SkipDefineBody();
  PepToken ReadIdentifier(bool escaped);
  PepToken ReadDirectiveOrMacro();
  PepToken ReadNumber();
  bool RealPartFollows() const;
  void ReadRealPart(PepToken& token);
  bool BasedPartFollows(std::size_t ahead) const;
  void ReadBasedPart(PepToken& token, std::optional<std::int64_t> size);
  PepToken ReadString();
  PepToken ReadSymbol();

  PepTextCursor cursor_;
};
