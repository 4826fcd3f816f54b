#include "HrfParser.h"

#include <array>
#include <cerrno>
#include <charconv>
#include <cstdint>
#include <cstring>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "CParserConfigHolder.h"
#include "Port/File.h"
#include "Port/MsgManData.h"
#include "Port/StringBase.h"

namespace Vad {
namespace {

enum class LineKind { kInstance, kSubmodule, kSubpackage, kModule, kPackage, kPackageBody, kOther };

// The host's expressions are POSIX ERE, which has no "\s": white space is [[:space:]] there.
constexpr std::string_view kEndPattern = "^[[:space:]]*ENDHIERARCHY[[:space:]]*$";

struct KeywordPattern {
  std::string_view pattern;
  LineKind kind;
};

// Tested in this order; the first match decides.
constexpr std::array<KeywordPattern, 6> kKeywordPatterns{{
    {"^[[:space:]]*INSTANCE[[:space:]]+.*$", LineKind::kInstance},
    {"^[[:space:]]*SUBMODULE[[:space:]]+.*$", LineKind::kSubmodule},
    {"^[[:space:]]*SUBPACKAGE[[:space:]]+.*$", LineKind::kSubpackage},
    {"^[[:space:]]*MODULE[[:space:]]+.*$", LineKind::kModule},
    {"^[[:space:]]*PACKAGE[[:space:]]+.*$", LineKind::kPackage},
    {"^[[:space:]]*PACKAGEBODY[[:space:]]+.*$", LineKind::kPackageBody},
}};

bool IsFieldSeparator(char c) { return c == ' ' || c == '\t'; }

bool IsBlankLine(std::string_view line) { return line.find_first_not_of(" \t") == std::string_view::npos; }

bool Matches(const Port::StringBase& line, std::string_view pattern) {
  std::size_t start = 0;
  std::size_t length = 0;
  return line.GetRangeOfMatch(pattern, start, length);
}

LineKind KindOf(const Port::StringBase& line) {
  for (const KeywordPattern& keyword : kKeywordPatterns) {
    if (Matches(line, keyword.pattern)) return keyword.kind;
  }
  return LineKind::kOther;
}

void RemoveEvery(std::string& text, std::string_view mark) {
  std::string kept;
  kept.reserve(text.size());
  std::size_t from = 0;
  for (std::size_t at = text.find(mark); at != std::string::npos; at = text.find(mark, from)) {
    kept.append(text, from, at - from);
    from = at + mark.size();
  }
  kept.append(text, from, std::string::npos);
  text.swap(kept);
}

std::vector<std::string_view> SplitFields(std::string_view line) {
  std::vector<std::string_view> fields;
  std::size_t pos = 0;
  while (pos < line.size()) {
    while (pos < line.size() && IsFieldSeparator(line[pos])) ++pos;
    std::size_t end = pos;
    while (end < line.size() && !IsFieldSeparator(line[end])) ++end;
    if (end > pos) fields.push_back(line.substr(pos, end - pos));
    pos = end;
  }
  return fields;
}

// A field of decimal digits only, within range; anything else is not a number.
bool ReadDecimal(std::string_view field, std::uint32_t& value) {
  if (field.empty()) return false;
  const char* end = field.data() + field.size();
  auto [stop, error] = std::from_chars(field.data(), end, value);
  return error == std::errc() && stop == end;
}

struct KeywordLine {
  Port::StringBase name;
  std::uint32_t line = 0;
};

// The name and line number of a keyword line: comment marks removed, fields split on blanks and
// tabs, the line number from the third field or else a numeric fourth one.
KeywordLine ReadKeywordLine(const Port::StringBase& text) {
  std::string line = text.str();
  RemoveEvery(line, "--");
  RemoveEvery(line, "//");
  std::vector<std::string_view> fields = SplitFields(line);
  KeywordLine result;
  if (fields.size() > 1) result.name = Port::StringBase(fields[1]);
  if (fields.size() > 2 && !ReadDecimal(fields[2], result.line)) result.line = 0;
  std::uint32_t fourth = 0;
  if (fields.size() > 3 && ReadDecimal(fields[3], fourth)) result.line = fourth;
  return result;
}

class BlockReader {
 public:
  explicit BlockReader(CParserConfigHolder& holder) : holder_(holder) {}

  void Read(Port::Stream& input) {
    Port::StringBase line;
    while (input.readline(line) == 1) {
      if (IsBlankLine(line.view())) continue;
      if (Matches(line, kEndPattern)) return;
      LineKind kind = KindOf(line);
      if (kind != LineKind::kOther) Record(kind, ReadKeywordLine(line));
    }
  }

 private:
  void Record(LineKind kind, const KeywordLine& keywordLine) {
    // A keyword without a name names no unit.
    if (keywordLine.name.IsEmpty()) return;
    const Port::StringBase& name = keywordLine.name;
    const std::uint32_t line = keywordLine.line;
    switch (kind) {
      case LineKind::kSubmodule:
        holder_.AddCompInst(Port::StringBase(), name, line, HrfTypeIds::Instance(), Port::StringBase());
        break;
      case LineKind::kSubpackage:
        holder_.AddUse(name, line, HrfTypeIds::Use(), true);
        break;
      case LineKind::kModule:
        holder_.AddArch(name, name, line, HrfTypeIds::Architecture());
        holder_.AddEntityDecl(name, line, true, HrfTypeIds::Entity());
        currentName_ = name;
        break;
      case LineKind::kPackage:
        holder_.AddPackageDecl(name, line, HrfTypeIds::Package());
        currentName_ = name;
        break;
      case LineKind::kPackageBody:
        holder_.AddPackageBody(name, line, HrfTypeIds::PackageBody());
        break;
      case LineKind::kInstance:
      case LineKind::kOther:
        break;
    }
  }

  CParserConfigHolder& holder_;
  // The module or package that the following lines belong to.
  Port::StringBase currentName_;
};

void ReportError(const Port::StringBase& path, const Port::StringBase& text) {
  Port_MsgManData::createObject("ProjectMgmt", path.c_str(), 0, "")->issueError("%s", text.c_str());
}

}  // namespace

int HrfParser::Parse(CParserConfigHolder& holder) {
  Port::StringBase path;
  holder.GetFullPath(path);
  std::unique_ptr<Port::Stream> input = Port::File::open(path.c_str(), "r");
  if (!input) {
    ReportError(path, Port::StringBase().Format("cannot open %s: %s\n", path.c_str(), std::strerror(errno)));
    return 1;
  }
  BlockReader(holder).Read(*input);
  // A line that does not fit in memory ends the reading as the end of the file would.
  if (input->error() || !input->geteof()) {
    ReportError(path, Port::StringBase().Format("%s could not be read to its end\n", path.c_str()));
  }
  Port::File::close(input);
  return 1;
}

}  // namespace Vad
