// The Verilog preprocessor of one compiled file: compiler directives, text macros, conditional
// compilation and includes. Comments are removed on the way; the line breaks of the source are
// kept so that every position keeps its original line.
//
// Problems go to the message log and never stop the work: what follows a problem is processed as
// well as it can be, and every kind of runaway input (self-inclusion, recursive or exploding
// macros) is cut at a limit with a message.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <unordered_set>
#include <vector>

#include "Port/InputLimits.h"
#include "vci/VerilogMacroState.h"
#include "vci/VerilogMessageLog.h"
#include "vci/VerilogPreprocessedText.h"

namespace Hx_Vci {

class VerilogPreprocessor {
 public:
  struct Limits {
    int includeDepth = Port::InputLimits::kMaxIncludeDepth;
    int macroDepth = Port::InputLimits::kMaxMacroDepth;
    // Text produced by one macro use in the file itself, nested expansions included.
    std::size_t macroExpansionBytes = Port::InputLimits::kMaxMacroExpansionBytes;
    // Text added by all macro expansions and included files of the compiled file.
    std::size_t expansionBudget = Port::InputLimits::kMaxExpansionBytes;
    // Files included by the compiled file, counted at every inclusion.
    std::size_t includeCount = Port::InputLimits::kMaxIncludesPerFile;
  };

  // `includeDirs` are searched in order after the including file's own directory. All three
  // references must outlive the preprocessor.
  VerilogPreprocessor(VerilogMacroState& macros, const std::vector<std::string>& includeDirs,
                      VerilogMessageLog& log, Limits limits);
  VerilogPreprocessor(VerilogMacroState& macros, const std::vector<std::string>& includeDirs,
                      VerilogMessageLog& log)
      : VerilogPreprocessor(macros, includeDirs, log, Limits()) {}

  // Preprocesses `text`, the content of the file `path`. Macro definitions go to the macro state.
  VerilogPreprocessedText Run(const std::string& path, std::string_view text);
  // The included files read by Run, and the places where an include was looked for in vain.
  std::vector<VerilogDependency> TakeDependencies() { return std::move(dependencies_); }

 private:
  enum class Directive {
    kMacro,  // not a directive: a macro use
    kDefine,
    kUndef,
    kUndefineAll,
    kIfdef,
    kIfndef,
    kElsif,
    kElse,
    kEndif,
    kInclude,
    kIgnoredWithArguments,  // the arguments run to the end of the line
    kIgnored,
    kFileName,
    kLineNumber,
  };

  // One text being processed: a file, or the expansion of one macro use.
  struct Source {
    std::string_view text;
    std::size_t pos = 0;
    std::uint32_t fileId = 0;  // an expansion's is the file where the macro was used
    bool isExpansion = false;
    bool stopped = false;
    int includeDepth = 0;
    int macroDepth = 0;
    std::size_t conditionalBase = 0;  // conditionals opened before this file began
    std::uint32_t expansionLine = 0;  // an expansion's line: that of the use in the file
    // Line counting of a file, done lazily up to lineMark.
    std::size_t lineMark = 0;
    std::uint32_t lineAtMark = 1;
  };

  struct Conditional {
    bool enclosingActive = true;
    bool branchActive = false;
    bool anyBranchTaken = false;
    bool sawElse = false;
    std::uint32_t line = 0;
  };

  static Directive Classify(std::string_view name);

  void Process(Source& s);
  void HandleBacktick(Source& s);
  void HandleSlash(Source& s);
  void HandleString(Source& s);
  void HandleEscapedIdentifier(Source& s);

  void HandleIfdef(Source& s, std::size_t at, bool negated);
  void HandleElsif(Source& s, std::size_t at);
  void HandleElse(Source& s, std::size_t at);
  void HandleEndif(Source& s, std::size_t at);
  void CloseConditionals(Source& s);
  void UpdateActive();

  void HandleDefine(Source& s, std::size_t at);
  bool ReadMacroParameters(Source& s, VerilogMacro* macro, std::size_t* breaks);
  void ReadMacroBody(Source& s, std::string* body, std::size_t* breaks);
  void HandleUndef(Source& s, std::size_t at);

  void HandleInclude(Source& s, std::size_t at);
  bool ReadIncludeName(Source& s, std::string* name);
  bool TakeInclusion(Source& s, std::size_t at);
  bool FindInclude(Source& s, std::size_t at, const std::string& name, std::string* path, std::string* text);
  void AddDependency(const std::string& path, const VerilogFileStamp& stamp);

  void ExpandMacro(Source& s, std::size_t at, std::string_view name);
  bool ReadMacroArguments(Source& s, std::size_t at, std::string_view name,
                          std::vector<std::string>* arguments, std::size_t* breaks);
  static std::string Substitute(const VerilogMacro& macro, const std::vector<std::string>& arguments);
  bool SpendBudget(Source& s, std::size_t at, std::size_t bytes);

  std::string_view ReadDirectiveName(Source& s);
  void SkipLineSpace(Source& s);
  void SkipRestOfLine(Source& s);
  void SkipLogicalLine(Source& s, std::size_t* breaks);
  std::size_t SkipBlockComment(Source& s, std::size_t at, std::size_t* breaks);
  static std::size_t SkipQuoted(std::string_view text, std::size_t at, std::size_t* breaks, bool* closed);

  void Emit(const Source& s, std::size_t from, std::size_t to);
  void EmitText(std::string_view text);
  void EmitLineBreaks(const Source& s, std::size_t count);
  void BeginSegment(std::uint32_t fileId, std::uint32_t line);

  std::uint32_t LineAt(Source& s, std::size_t pos);
  const std::string& FileName(const Source& s) const { return out_.fileNames[s.fileId]; }
  void Error(Source& s, std::size_t at, const char* format, ...) __attribute__((format(printf, 4, 5)));

  VerilogMacroState& macros_;
  const std::vector<std::string>& includeDirs_;
  VerilogMessageLog& log_;
  Limits limits_;

  VerilogPreprocessedText out_;
  std::vector<Conditional> conditionals_;
  bool active_ = true;
  std::vector<VerilogDependency> dependencies_;
  std::unordered_set<std::string> dependencyPaths_;
  std::size_t budgetUsed_ = 0;
  std::size_t includesTaken_ = 0;
  bool budgetSpent_ = false;
  std::size_t topExpansionBytes_ = 0;
  bool abortExpansion_ = false;
};

}  // namespace Hx_Vci
