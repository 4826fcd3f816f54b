// Finds the modules of preprocessed Verilog text, with their ports and module instances. It is no
// elaborator: everything else (declarations, processes, functions, specify blocks, primitives,
// gate instances) is skipped by its structure, and after a syntax error the parser picks up again
// at the next statement, so that what can be recognised is.
#pragma once

#include <string>
#include <utility>
#include <vector>

#include "vci/VerilogDesignInfo.h"
#include "vci/VerilogLexer.h"
#include "vci/VerilogMessageLog.h"
#include "vci/VerilogPreprocessedText.h"

namespace Hx_Vci {

class VerilogModuleParser {
 public:
  // Deeper nesting of blocks is skipped without looking into it, so the parser's own stack stays
  // small whatever the input.
  static constexpr int kMaxNesting = 200;

  // Both must outlive the parser.
  VerilogModuleParser(const VerilogPreprocessedText& source, VerilogMessageLog& log);

  // The named modules in source order, also those that lack their endmodule.
  std::vector<VerilogModuleInfo> Parse();
  // The names of the user-defined primitives that Parse met.
  std::vector<std::string> TakePrimitives() { return std::move(primitives_); }

 private:
  void Advance() { token_ = lexer_.Next(); }
  bool AtBoundary() const {
    return token_.IsEnd() || VerilogKeywords::Has(token_.keyword, VerilogKeywordRole::kBoundary);
  }

  void ParseModule();
  void ParsePortList(VerilogModuleInfo& module);
  std::string ScanPort();
  // False when the module's items end here: at endmodule, a unit boundary or the end of the text.
  bool ParseModuleItem(VerilogModuleInfo& module, int depth);
  void ParseGenerateItem(VerilogModuleInfo& module, int depth);
  void ParseGenerateBlock(VerilogModuleInfo& module, int depth);
  void ParseGenerateIf(VerilogModuleInfo& module, int depth);
  void ParseGenerateCase(VerilogModuleInfo& module, int depth);
  void ParseInstances(VerilogModuleInfo& module);
  bool SkipDriveStrength();

  void SkipStatement(int depth);
  void SkipEventControl();
  void SkipKeywordBlock();
  void SkipRegion();
  void SkipGroup(char open, char close);
  void SkipDeclaration();
  void SkipToSemicolon();
  // One statement or block, without nesting into it.
  void SkipFlat();
  void SkipCaseLabel();
  void SkipOptionalLabel();
  bool TooDeep(int depth);

  void Error(const VerilogToken& at, const char* format, ...) __attribute__((format(printf, 3, 4)));

  VerilogLexer lexer_;
  VerilogMessageLog& log_;
  VerilogToken token_;
  std::vector<VerilogModuleInfo> modules_;
  std::vector<std::string> primitives_;
  bool nestingReported_ = false;
};

}  // namespace Hx_Vci
