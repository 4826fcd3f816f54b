#include "vci/VerilogPreprocessor.h"

#include <algorithm>
#include <cstdarg>
#include <unordered_map>
#include <utility>

#include "vci/VerilogChars.h"
#include "vci/VerilogMessageText.h"
#include "vci/VerilogSourceFile.h"

namespace Hx_Vci {

namespace Text = VerilogMessageText;
using VerilogChars::ContinuationLength;
using VerilogChars::IsIdentifierChar;
using VerilogChars::IsIdentifierStart;
using VerilogChars::IsLineSpace;
using VerilogChars::IsSpace;
using VerilogChars::ScanIdentifier;

namespace {

std::size_t CountLineBreaks(std::string_view text, std::size_t from, std::size_t to) {
  return static_cast<std::size_t>(std::count(text.begin() + from, text.begin() + to, '\n'));
}

std::string_view Trim(std::string_view text) {
  while (!text.empty() && IsSpace(text.front())) text.remove_prefix(1);
  while (!text.empty() && IsSpace(text.back())) text.remove_suffix(1);
  return text;
}

std::size_t FindSpecial(std::string_view text, std::size_t from) {
  const char* p = text.data() + from;
  const char* end = text.data() + text.size();
  while (p < end && !VerilogChars::Has(*p, VerilogChars::kPreprocessorSpecial)) ++p;
  return static_cast<std::size_t>(p - text.data());
}

std::string DirectoryOf(const std::string& path) {
  std::size_t slash = path.rfind('/');
  if (slash == std::string::npos) {
    return ".";
  }
  return slash == 0 ? std::string("/") : path.substr(0, slash);
}

std::string JoinPath(const std::string& directory, const std::string& name) {
  if (directory.empty() || directory.back() == '/') {
    return directory + name;
  }
  return directory + "/" + name;
}

std::string ShortName(std::string_view name) { return VerilogMessageLog::Quote(name); }

}  // namespace

VerilogPreprocessor::VerilogPreprocessor(VerilogMacroState& macros,
                                         const std::vector<std::string>& includeDirs, VerilogMessageLog& log,
                                         Limits limits)
    : macros_(macros), includeDirs_(includeDirs), log_(log), limits_(limits) {}

VerilogPreprocessedText VerilogPreprocessor::Run(const std::string& path, std::string_view text) {
  out_ = VerilogPreprocessedText();
  out_.fileNames.push_back(path);
  out_.segments.push_back({0, 0, 1});
  out_.text.reserve(text.size() + 64);
  conditionals_.clear();
  active_ = true;
  dependencies_.clear();
  dependencyPaths_.clear();
  budgetUsed_ = 0;
  budgetSpent_ = false;
  includesTaken_ = 0;

  Source s;
  s.text = text;
  if (text.substr(0, 3) == "\xEF\xBB\xBF") {
    s.pos = 3;  // a byte-order mark
  }
  Process(s);
  CloseConditionals(s);
  return std::move(out_);
}

VerilogPreprocessor::Directive VerilogPreprocessor::Classify(std::string_view name) {
  static const std::unordered_map<std::string_view, Directive> kDirectives = {
      {"define", Directive::kDefine},
      {"undef", Directive::kUndef},
      {"ifdef", Directive::kIfdef},
      {"ifndef", Directive::kIfndef},
      {"elsif", Directive::kElsif},
      {"else", Directive::kElse},
      {"endif", Directive::kEndif},
      {"include", Directive::kInclude},
      {"timescale", Directive::kIgnoredWithArguments},
      {"default_nettype", Directive::kIgnoredWithArguments},
      {"line", Directive::kIgnoredWithArguments},
      {"pragma", Directive::kIgnoredWithArguments},
      {"unconnected_drive", Directive::kIgnoredWithArguments},
      {"begin_keywords", Directive::kIgnoredWithArguments},
      {"uselib", Directive::kIgnoredWithArguments},
      {"default_decay_time", Directive::kIgnoredWithArguments},
      {"default_trireg_strength", Directive::kIgnoredWithArguments},
      {"resetall", Directive::kIgnored},
      {"celldefine", Directive::kIgnored},
      {"endcelldefine", Directive::kIgnored},
      {"nounconnected_drive", Directive::kIgnored},
      {"end_keywords", Directive::kIgnored},
      {"undefineall", Directive::kUndefineAll},
      {"delay_mode_distributed", Directive::kIgnored},
      {"delay_mode_path", Directive::kIgnored},
      {"delay_mode_unit", Directive::kIgnored},
      {"delay_mode_zero", Directive::kIgnored},
      {"accelerate", Directive::kIgnored},
      {"noaccelerate", Directive::kIgnored},
      {"autoexpand_vectornets", Directive::kIgnored},
      {"expand_vectornets", Directive::kIgnored},
      {"noexpand_vectornets", Directive::kIgnored},
      {"remove_gatenames", Directive::kIgnored},
      {"noremove_gatenames", Directive::kIgnored},
      {"remove_netnames", Directive::kIgnored},
      {"noremove_netnames", Directive::kIgnored},
      {"protect", Directive::kIgnored},
      {"endprotect", Directive::kIgnored},
      {"__FILE__", Directive::kFileName},
      {"__LINE__", Directive::kLineNumber},
  };
  auto found = kDirectives.find(name);
  return found == kDirectives.end() ? Directive::kMacro : found->second;
}

void VerilogPreprocessor::Process(Source& s) {
  const std::size_t size = s.text.size();
  while (s.pos < size && !s.stopped && !(s.isExpansion && abortExpansion_)) {
    std::size_t special = FindSpecial(s.text, s.pos);
    Emit(s, s.pos, special);
    s.pos = special;
    if (special >= size) {
      break;
    }
    switch (s.text[special]) {
      case '`':
        HandleBacktick(s);
        break;
      case '/':
        HandleSlash(s);
        break;
      case '"':
        HandleString(s);
        break;
      default:
        HandleEscapedIdentifier(s);
        break;
    }
  }
}

void VerilogPreprocessor::HandleBacktick(Source& s) {
  const std::size_t at = s.pos;
  const std::size_t nameEnd = ScanIdentifier(s.text, at + 1);
  s.pos = nameEnd == at + 1 ? at + 1 : nameEnd;
  if (nameEnd == at + 1) {
    if (active_) {
      Error(s, at, Text::kStrayBacktick);
    }
    return;
  }
  const std::string_view name = s.text.substr(at + 1, nameEnd - at - 1);
  const Directive directive = Classify(name);
  switch (directive) {
    case Directive::kIfdef:
    case Directive::kIfndef:
      HandleIfdef(s, at, directive == Directive::kIfndef);
      return;
    case Directive::kElsif:
      HandleElsif(s, at);
      return;
    case Directive::kElse:
      HandleElse(s, at);
      return;
    case Directive::kEndif:
      HandleEndif(s, at);
      return;
    default:
      break;
  }
  if (!active_) {
    return;
  }
  switch (directive) {
    case Directive::kDefine:
      HandleDefine(s, at);
      return;
    case Directive::kUndef:
      HandleUndef(s, at);
      return;
    case Directive::kUndefineAll:
      macros_.UndefineAll();
      return;
    case Directive::kInclude:
      HandleInclude(s, at);
      return;
    case Directive::kIgnoredWithArguments:
      SkipRestOfLine(s);
      return;
    case Directive::kFileName:
      EmitText("\"" + FileName(s) + "\"");
      return;
    case Directive::kLineNumber:
      EmitText(std::to_string(LineAt(s, at)));
      return;
    case Directive::kMacro:
      ExpandMacro(s, at, name);
      return;
    default:
      return;
  }
}

void VerilogPreprocessor::HandleSlash(Source& s) {
  const std::size_t at = s.pos;
  const char next = at + 1 < s.text.size() ? s.text[at + 1] : '\0';
  if (next == '/') {
    std::size_t lineEnd = s.text.find('\n', at + 2);
    s.pos = lineEnd == std::string_view::npos ? s.text.size() : lineEnd;
    return;
  }
  if (next == '*') {
    std::size_t breaks = 0;
    s.pos = SkipBlockComment(s, at, &breaks);
    if (!s.stopped && active_) {
      EmitText(" ");  // a comment separates tokens
    }
    EmitLineBreaks(s, breaks);
    return;
  }
  Emit(s, at, at + 1);
  s.pos = at + 1;
}

void VerilogPreprocessor::HandleString(Source& s) {
  const std::size_t at = s.pos;
  std::size_t breaks = 0;
  bool closed = false;
  const std::size_t end = SkipQuoted(s.text, at, &breaks, &closed);
  Emit(s, at, end);
  s.pos = end;
  if (closed) {
    return;
  }
  if (active_) {
    Error(s, at, end < s.text.size() ? Text::kUnterminatedString : Text::kUnterminatedStringAtEnd);
    EmitText("\"");  // the lexer then sees a complete string
  }
}

void VerilogPreprocessor::HandleEscapedIdentifier(Source& s) {
  std::size_t end = s.pos + 1;
  while (end < s.text.size() && !IsSpace(s.text[end])) ++end;
  Emit(s, s.pos, end);
  s.pos = end;
}

void VerilogPreprocessor::HandleIfdef(Source& s, std::size_t at, bool negated) {
  const std::string_view name = ReadDirectiveName(s);
  if (name.empty() && active_) {
    Error(s, at, Text::kDirectiveNeedsName, negated ? "ifndef" : "ifdef");
  }
  const bool defined = !name.empty() && macros_.Find(name) != nullptr;
  const bool taken = !name.empty() && defined != negated;
  conditionals_.push_back({active_, taken, taken, false, LineAt(s, at)});
  UpdateActive();
}

void VerilogPreprocessor::HandleElsif(Source& s, std::size_t at) {
  const std::string_view name = ReadDirectiveName(s);
  if (conditionals_.size() <= s.conditionalBase) {
    if (active_) {
      Error(s, at, Text::kConditionalWithoutIf, "elsif");
    }
    return;
  }
  Conditional& conditional = conditionals_.back();
  if (conditional.enclosingActive && conditional.sawElse) {
    Error(s, at, Text::kConditionalAfterElse, "elsif");
  }
  if (conditional.enclosingActive && name.empty()) {
    Error(s, at, Text::kDirectiveNeedsName, "elsif");
  }
  const bool defined = !name.empty() && macros_.Find(name) != nullptr;
  conditional.branchActive = !conditional.anyBranchTaken && defined;
  conditional.anyBranchTaken = conditional.anyBranchTaken || conditional.branchActive;
  UpdateActive();
}

void VerilogPreprocessor::HandleElse(Source& s, std::size_t at) {
  if (conditionals_.size() <= s.conditionalBase) {
    if (active_) {
      Error(s, at, Text::kConditionalWithoutIf, "else");
    }
    return;
  }
  Conditional& conditional = conditionals_.back();
  if (conditional.enclosingActive && conditional.sawElse) {
    Error(s, at, Text::kConditionalAfterElse, "else");
  }
  conditional.branchActive = !conditional.anyBranchTaken;
  conditional.anyBranchTaken = true;
  conditional.sawElse = true;
  UpdateActive();
}

void VerilogPreprocessor::HandleEndif(Source& s, std::size_t at) {
  if (conditionals_.size() <= s.conditionalBase) {
    if (active_) {
      Error(s, at, Text::kConditionalWithoutIf, "endif");
    }
    return;
  }
  conditionals_.pop_back();
  UpdateActive();
}

void VerilogPreprocessor::CloseConditionals(Source& s) {
  // Reported on the last line of the file, not on the empty one after its final line break.
  const std::size_t lastLine = !s.text.empty() && s.text.back() == '\n' ? s.text.size() - 1 : s.text.size();
  while (conditionals_.size() > s.conditionalBase) {
    Error(s, lastLine, Text::kUnterminatedConditional, static_cast<int>(conditionals_.back().line));
    conditionals_.pop_back();
  }
  UpdateActive();
}

void VerilogPreprocessor::UpdateActive() {
  active_ =
      conditionals_.empty() || (conditionals_.back().enclosingActive && conditionals_.back().branchActive);
}

void VerilogPreprocessor::HandleDefine(Source& s, std::size_t at) {
  const std::string_view name = ReadDirectiveName(s);
  std::size_t breaks = 0;
  if (name.empty()) {
    Error(s, at, Text::kDefineWithoutName);
    SkipLogicalLine(s, &breaks);
    EmitLineBreaks(s, breaks);
    return;
  }
  VerilogMacro macro;
  if (s.pos < s.text.size() && s.text[s.pos] == '(' && !ReadMacroParameters(s, &macro, &breaks)) {
    Error(s, at, Text::kBadMacroParameters, ShortName(name).c_str());
    SkipLogicalLine(s, &breaks);
    EmitLineBreaks(s, breaks);
    return;
  }
  ReadMacroBody(s, &macro.body, &breaks);
  EmitLineBreaks(s, breaks);
  if (Classify(name) != Directive::kMacro) {
    Error(s, at, Text::kDirectiveRedefined, ShortName(name).c_str());
    return;
  }
  macros_.Define(name, std::move(macro));
}

bool VerilogPreprocessor::ReadMacroParameters(Source& s, VerilogMacro* macro, std::size_t* breaks) {
  const std::string_view text = s.text;
  auto skipSpace = [&] {
    while (s.pos < text.size()) {
      if (std::size_t continuation = ContinuationLength(text, s.pos)) {
        s.pos += continuation;
        ++*breaks;
      } else if (IsLineSpace(text[s.pos])) {
        ++s.pos;
      } else {
        break;
      }
    }
  };
  macro->hasParameters = true;
  ++s.pos;  // the '('
  skipSpace();
  if (s.pos < text.size() && text[s.pos] == ')') {
    ++s.pos;
    return true;
  }
  while (s.pos < text.size()) {
    skipSpace();
    const std::size_t nameEnd = ScanIdentifier(text, s.pos);
    if (nameEnd == s.pos) {
      return false;
    }
    macro->parameters.emplace_back(text.substr(s.pos, nameEnd - s.pos));
    macro->defaults.emplace_back();
    s.pos = nameEnd;
    skipSpace();
    if (s.pos < text.size() && text[s.pos] == '=') {
      const std::size_t start = ++s.pos;
      int depth = 0;
      while (s.pos < text.size() && text[s.pos] != '\n' &&
             !(depth == 0 && (text[s.pos] == ',' || text[s.pos] == ')'))) {
        depth += text[s.pos] == '(' ? 1 : text[s.pos] == ')' ? -1 : 0;
        ++s.pos;
      }
      macro->defaults.back() = std::string(Trim(text.substr(start, s.pos - start)));
    }
    if (s.pos >= text.size()) {
      return false;
    }
    if (text[s.pos] == ')') {
      ++s.pos;
      return true;
    }
    if (text[s.pos] != ',') {
      return false;
    }
    ++s.pos;
  }
  return false;
}

void VerilogPreprocessor::ReadMacroBody(Source& s, std::string* body, std::size_t* breaks) {
  const std::string_view text = s.text;
  while (s.pos < text.size()) {
    const char c = text[s.pos];
    if (c == '\n') {
      break;
    }
    if (std::size_t continuation = ContinuationLength(text, s.pos)) {
      body->push_back('\n');
      ++*breaks;
      s.pos += continuation;
      continue;
    }
    const char next = s.pos + 1 < text.size() ? text[s.pos + 1] : '\0';
    if (c == '/' && next == '/') {
      SkipRestOfLine(s);
      break;
    }
    if (c == '/' && next == '*') {
      s.pos = SkipBlockComment(s, s.pos, breaks);
      body->push_back(' ');
      continue;
    }
    if (c == '"') {
      bool closed = false;
      const std::size_t end = SkipQuoted(text, s.pos, breaks, &closed);
      body->append(text.substr(s.pos, end - s.pos));
      s.pos = end;
      if (!closed) {
        Error(s, s.pos, Text::kUnterminatedString);
      }
      continue;
    }
    body->push_back(c);
    ++s.pos;
  }
  *body = std::string(Trim(*body));
}

void VerilogPreprocessor::HandleUndef(Source& s, std::size_t at) {
  const std::string_view name = ReadDirectiveName(s);
  if (name.empty()) {
    Error(s, at, Text::kDirectiveNeedsName, "undef");
    return;
  }
  macros_.Undefine(name);
}

void VerilogPreprocessor::HandleInclude(Source& s, std::size_t at) {
  std::string name;
  if (!ReadIncludeName(s, &name)) {
    Error(s, at, Text::kIncludeNeedsFile);
    SkipRestOfLine(s);
    return;
  }
  if (s.includeDepth >= limits_.includeDepth) {
    Error(s, at, Text::kIncludeTooDeep, limits_.includeDepth, ShortName(name).c_str());
    return;
  }
  if (budgetSpent_ || !TakeInclusion(s, at)) {
    return;
  }
  std::string path;
  std::string content;
  if (!FindInclude(s, at, name, &path, &content) || !SpendBudget(s, at, content.size())) {
    return;
  }
  const auto fileId = static_cast<std::uint32_t>(out_.fileNames.size());
  out_.fileNames.push_back(path);
  BeginSegment(fileId, 1);

  Source included;
  included.text = content;
  included.fileId = fileId;
  included.includeDepth = s.includeDepth + 1;
  included.macroDepth = s.macroDepth;
  included.conditionalBase = conditionals_.size();
  Process(included);
  CloseConditionals(included);

  BeginSegment(s.fileId, LineAt(s, s.pos));
}

// Each inclusion counts, so that headers that include the next one twice cannot double the work
// at every level.
bool VerilogPreprocessor::TakeInclusion(Source& s, std::size_t at) {
  if (includesTaken_ == limits_.includeCount) Error(s, at, Text::kTooManyIncludes, limits_.includeCount);
  if (includesTaken_ >= limits_.includeCount) {
    includesTaken_ = limits_.includeCount + 1;
    return false;
  }
  ++includesTaken_;
  return true;
}

bool VerilogPreprocessor::ReadIncludeName(Source& s, std::string* name) {
  SkipLineSpace(s);
  const std::string_view text = s.text;
  if (s.pos >= text.size()) {
    return false;
  }
  const char open = text[s.pos];
  if (open == '"' || open == '<') {
    const char close = open == '"' ? '"' : '>';
    std::size_t end = s.pos + 1;
    while (end < text.size() && text[end] != close && text[end] != '\n') ++end;
    if (end >= text.size() || text[end] != close || end == s.pos + 1) {
      return false;
    }
    *name = std::string(text.substr(s.pos + 1, end - s.pos - 1));
    s.pos = end + 1;
    return true;
  }
  if (open == '`') {
    // `include `NAME, where NAME stands for a quoted file name
    const std::size_t nameEnd = ScanIdentifier(text, s.pos + 1);
    const VerilogMacro* macro = macros_.Find(text.substr(s.pos + 1, nameEnd - s.pos - 1));
    if (macro == nullptr || macro->hasParameters) {
      return false;
    }
    const std::string_view body = Trim(macro->body);
    if (body.size() < 3 || body.front() != '"' || body.back() != '"') {
      return false;
    }
    *name = std::string(body.substr(1, body.size() - 2));
    s.pos = nameEnd;
    return true;
  }
  return false;
}

bool VerilogPreprocessor::FindInclude(Source& s, std::size_t at, const std::string& name, std::string* path,
                                      std::string* text) {
  std::vector<std::string> candidates;
  if (name.front() == '/') {
    candidates.push_back(name);
  } else {
    candidates.push_back(JoinPath(DirectoryOf(FileName(s)), name));
    for (const std::string& directory : includeDirs_) {
      candidates.push_back(JoinPath(directory, name));
    }
  }
  const std::string* unreadable = nullptr;
  for (const std::string& candidate : candidates) {
    VerilogFileStamp stamp;
    const VerilogSourceFile::ReadStatus status = VerilogSourceFile::Read(candidate, text, &stamp);
    AddDependency(candidate, stamp);
    if (status == VerilogSourceFile::ReadStatus::kOk) {
      *path = candidate;
      return true;
    }
    if (stamp.exists && unreadable == nullptr) {
      unreadable = &candidate;
    }
  }
  if (unreadable != nullptr) {
    Error(s, at, Text::kIncludeUnreadable, ShortName(*unreadable).c_str());
  } else {
    Error(s, at, Text::kIncludeNotFound, ShortName(name).c_str());
  }
  return false;
}

void VerilogPreprocessor::AddDependency(const std::string& path, const VerilogFileStamp& stamp) {
  if (dependencyPaths_.insert(path).second) {
    dependencies_.push_back({path, stamp});
  }
}

void VerilogPreprocessor::ExpandMacro(Source& s, std::size_t at, std::string_view name) {
  const VerilogMacro* macro = macros_.Find(name);
  if (macro == nullptr) {
    Error(s, at, Text::kUndefinedMacro, ShortName(name).c_str());
    return;
  }
  if (!s.isExpansion) {
    topExpansionBytes_ = 0;
    abortExpansion_ = false;
  }
  if (budgetSpent_ || abortExpansion_) {
    return;
  }
  if (s.macroDepth >= limits_.macroDepth) {
    Error(s, at, Text::kMacroTooDeep, ShortName(name).c_str(), limits_.macroDepth);
    abortExpansion_ = true;
    return;
  }
  std::vector<std::string> arguments;
  std::size_t breaks = 0;
  if (macro->hasParameters && !ReadMacroArguments(s, at, name, &arguments, &breaks)) {
    return;
  }
  if (macro->parameters.size() < arguments.size() && !(arguments.size() == 1 && arguments[0].empty())) {
    Error(s, at, Text::kTooManyMacroArguments, ShortName(name).c_str(), macro->parameters.size(),
          arguments.size());
  }
  const std::string expansion = Substitute(*macro, arguments);
  topExpansionBytes_ += expansion.size();
  if (topExpansionBytes_ > limits_.macroExpansionBytes) {
    Error(s, at, Text::kMacroTooLarge, ShortName(name).c_str(), limits_.macroExpansionBytes);
    abortExpansion_ = true;
    return;
  }
  if (!SpendBudget(s, at, expansion.size())) {
    return;
  }
  Source expanded;
  expanded.text = expansion;
  expanded.fileId = s.fileId;
  expanded.isExpansion = true;
  expanded.includeDepth = s.includeDepth;
  expanded.macroDepth = s.macroDepth + 1;
  expanded.conditionalBase = s.conditionalBase;
  expanded.expansionLine = LineAt(s, at);
  Process(expanded);
  // The expansion stands on the line of the use; a use whose arguments ran over several lines
  // gives those line breaks back after it.
  EmitLineBreaks(s, breaks);
}

bool VerilogPreprocessor::ReadMacroArguments(Source& s, std::size_t at, std::string_view name,
                                             std::vector<std::string>* arguments, std::size_t* breaks) {
  const std::string_view text = s.text;
  std::size_t p = s.pos;
  while (p < text.size() && IsSpace(text[p])) ++p;
  if (p >= text.size() || text[p] != '(') {
    Error(s, at, Text::kMacroNeedsArguments, ShortName(name).c_str());
    return false;
  }
  *breaks += CountLineBreaks(text, s.pos, p);
  ++p;
  int depth = 0;
  std::string current;
  while (p < text.size()) {
    const char c = text[p];
    const char next = p + 1 < text.size() ? text[p + 1] : '\0';
    if (c == ')' && depth == 0) {
      arguments->emplace_back(Trim(current));
      s.pos = p + 1;
      return true;
    }
    if (c == ',' && depth == 0) {
      arguments->emplace_back(Trim(current));
      current.clear();
      ++p;
    } else if (c == '(' || c == '[' || c == '{') {
      ++depth;
      current.push_back(c);
      ++p;
    } else if (c == ')' || c == ']' || c == '}') {
      depth = depth > 0 ? depth - 1 : 0;
      current.push_back(c);
      ++p;
    } else if (c == '"') {
      bool closed = false;
      const std::size_t end = SkipQuoted(text, p, breaks, &closed);
      current.append(text.substr(p, end - p));
      p = end;
    } else if (c == '/' && next == '/') {
      const std::size_t lineEnd = text.find('\n', p);
      p = lineEnd == std::string_view::npos ? text.size() : lineEnd;
    } else if (c == '/' && next == '*') {
      const std::size_t close = text.find("*/", p + 2);
      const std::size_t end = close == std::string_view::npos ? text.size() : close + 2;
      *breaks += CountLineBreaks(text, p, end);
      current.push_back(' ');
      p = end;
    } else if (c == '\n') {
      ++*breaks;
      current.push_back(' ');
      ++p;
    } else {
      current.push_back(c);
      ++p;
    }
  }
  Error(s, at, Text::kUnterminatedMacroArguments, ShortName(name).c_str());
  s.pos = text.size();
  return false;
}

std::string VerilogPreprocessor::Substitute(const VerilogMacro& macro,
                                            const std::vector<std::string>& arguments) {
  const std::string_view body = macro.body;
  if (macro.parameters.empty() && body.find('`') == std::string_view::npos) {
    return macro.body;
  }
  auto actual = [&](std::size_t index) -> std::string_view {
    if (index < arguments.size() && !(arguments[index].empty() && !macro.defaults[index].empty())) {
      return arguments[index];
    }
    return macro.defaults[index];
  };
  std::string out;
  out.reserve(body.size() + 16);
  std::size_t i = 0;
  bool afterPaste = false;
  while (i < body.size()) {
    const char c = body[i];
    const char previous = i > 0 ? body[i - 1] : ' ';
    // A word right after a single ` names a macro, and one after a ' is part of a based number.
    const bool wordStart = afterPaste || (!IsIdentifierChar(previous) && previous != '`' && previous != '\'');
    afterPaste = false;
    if (IsIdentifierStart(c) && wordStart) {
      const std::size_t end = ScanIdentifier(body, i);
      const std::string_view word = body.substr(i, end - i);
      auto parameter = std::find(macro.parameters.begin(), macro.parameters.end(), word);
      out.append(parameter == macro.parameters.end()
                     ? word
                     : actual(static_cast<std::size_t>(parameter - macro.parameters.begin())));
      i = end;
    } else if (body.substr(i, 2) == "``") {
      i += 2;  // token pasting: the two sides simply join
      afterPaste = true;
    } else if (body.substr(i, 2) == "`\"") {
      out.push_back('"');
      i += 2;
    } else if (body.substr(i, 4) == "`\\`\"") {
      out.append("\\\"");
      i += 4;
    } else if (c == '"') {
      std::size_t breaks = 0;
      bool closed = false;
      const std::size_t end = SkipQuoted(body, i, &breaks, &closed);
      out.append(body.substr(i, end - i));
      i = end;
    } else if (c == '\\') {
      std::size_t end = i + 1;
      while (end < body.size() && !IsSpace(body[end])) ++end;
      out.append(body.substr(i, end - i));
      i = end;
    } else {
      out.push_back(c);
      ++i;
    }
  }
  return out;
}

bool VerilogPreprocessor::SpendBudget(Source& s, std::size_t at, std::size_t bytes) {
  budgetUsed_ += bytes;
  if (budgetUsed_ <= limits_.expansionBudget) {
    return true;
  }
  if (!budgetSpent_) {
    Error(s, at, Text::kExpansionBudgetSpent, limits_.expansionBudget);
    budgetSpent_ = true;
  }
  return false;
}

std::string_view VerilogPreprocessor::ReadDirectiveName(Source& s) {
  SkipLineSpace(s);
  const std::size_t end = ScanIdentifier(s.text, s.pos);
  const std::string_view name = s.text.substr(s.pos, end - s.pos);
  s.pos = end;
  return name;
}

void VerilogPreprocessor::SkipLineSpace(Source& s) {
  while (s.pos < s.text.size() && IsLineSpace(s.text[s.pos])) ++s.pos;
}

void VerilogPreprocessor::SkipRestOfLine(Source& s) {
  const std::size_t lineEnd = s.text.find('\n', s.pos);
  s.pos = lineEnd == std::string_view::npos ? s.text.size() : lineEnd;
}

void VerilogPreprocessor::SkipLogicalLine(Source& s, std::size_t* breaks) {
  while (s.pos < s.text.size() && s.text[s.pos] != '\n') {
    if (std::size_t continuation = ContinuationLength(s.text, s.pos)) {
      s.pos += continuation;
      ++*breaks;
    } else {
      ++s.pos;
    }
  }
}

std::size_t VerilogPreprocessor::SkipBlockComment(Source& s, std::size_t at, std::size_t* breaks) {
  const std::size_t close = s.text.find("*/", at + 2);
  if (close == std::string_view::npos) {
    *breaks += CountLineBreaks(s.text, at, s.text.size());
    Error(s, at, Text::kUnterminatedComment);
    s.stopped = true;
    return s.text.size();
  }
  *breaks += CountLineBreaks(s.text, at, close);
  return close + 2;
}

std::size_t VerilogPreprocessor::SkipQuoted(std::string_view text, std::size_t at, std::size_t* breaks,
                                            bool* closed) {
  std::size_t i = at + 1;
  while (i < text.size()) {
    const char c = text[i];
    if (c == '"') {
      *closed = true;
      return i + 1;
    }
    if (c == '\n') {
      return i;
    }
    if (c == '\\' && i + 1 < text.size()) {
      if (std::size_t continuation = ContinuationLength(text, i)) {
        ++*breaks;
        i += continuation;
      } else {
        i += 2;
      }
      continue;
    }
    ++i;
  }
  return i;
}

void VerilogPreprocessor::Emit(const Source& s, std::size_t from, std::size_t to) {
  if (to <= from) {
    return;
  }
  const std::string_view run = s.text.substr(from, to - from);
  if (active_) {
    const std::size_t start = out_.text.size();
    out_.text.append(run);
    if (s.isExpansion) {
      std::replace(out_.text.begin() + static_cast<std::ptrdiff_t>(start), out_.text.end(), '\n', ' ');
    }
  } else if (!s.isExpansion) {
    out_.text.append(CountLineBreaks(run, 0, run.size()), '\n');
  }
}

void VerilogPreprocessor::EmitText(std::string_view text) {
  if (active_) {
    out_.text.append(text);
  }
}

void VerilogPreprocessor::EmitLineBreaks(const Source& s, std::size_t count) {
  if (s.isExpansion) {
    if (active_ && count > 0) {
      out_.text.push_back(' ');
    }
    return;
  }
  out_.text.append(count, '\n');
}

void VerilogPreprocessor::BeginSegment(std::uint32_t fileId, std::uint32_t line) {
  out_.text.push_back('\n');
  out_.segments.push_back({out_.text.size(), fileId, line});
}

std::uint32_t VerilogPreprocessor::LineAt(Source& s, std::size_t pos) {
  if (s.isExpansion) {
    return s.expansionLine;
  }
  pos = std::min(pos, s.text.size());
  if (pos < s.lineMark) {
    s.lineMark = 0;
    s.lineAtMark = 1;
  }
  s.lineAtMark += static_cast<std::uint32_t>(CountLineBreaks(s.text, s.lineMark, pos));
  s.lineMark = pos;
  return s.lineAtMark;
}

void VerilogPreprocessor::Error(Source& s, std::size_t at, const char* format, ...) {
  if (log_.Full()) {
    return;
  }
  std::va_list args;
  va_start(args, format);
  log_.ReportV(VerilogSeverity::kError, FileName(s), static_cast<int>(LineAt(s, at)), format, args);
  va_end(args);
}

}  // namespace Hx_Vci
