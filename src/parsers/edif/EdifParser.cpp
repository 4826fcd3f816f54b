#include "EdifParser.h"

#include <array>
#include <cctype>
#include <cstdio>
#include <filesystem>
#include <string_view>
#include <system_error>

#include "Port/MsgManData.h"
#include "qhParser.h"

namespace Vad {

namespace {

constexpr const char* kMessageSource = "../src/EdifParser";
constexpr const char* kRevision = "1.1";
constexpr const char* kHierarchyExtension = ".hrf";

bool EqualsIgnoringCase(std::string_view a, std::string_view b) {
  if (a.size() != b.size()) return false;
  for (std::size_t i = 0; i < a.size(); ++i) {
    if (std::tolower(static_cast<unsigned char>(a[i])) != std::tolower(static_cast<unsigned char>(b[i])))
      return false;
  }
  return true;
}

std::string WithoutQuotes(std::string_view text) {
  std::string result;
  for (char c : text) {
    if (c != '"') result += c;
  }
  return result;
}

// The slots a hierarchy file is read with when it stands in for a netlist.
CParserConfigHolder::TypeIds HierarchyFallbackTypeIds() {
  auto id = [](const char* text) { return Port::XUID(std::string_view(text)); };
  return {id("{15B800DC-CD3B-45f9-B26A-26BFDD3441EF}"), id("{3E515CB2-8A29-45dd-860D-0C91C6E19881}"),
          id("{3E515CB2-8A29-45dd-860D-0C91C6E19881}"), id("{35077F2B-87EA-47ac-834F-8C02E49945F0}"),
          id("{98867360-CC87-4033-AB17-973F0CEB374F}"), id("{F8EC4980-CDA2-4346-9E3C-DB50D7DA83E9}"),
          id("{2391D1AB-9BB0-4a61-A080-3CE4BFE2E116}")};
}

}  // namespace

// Reads a netlist line by line into a fixed buffer; a line longer than the buffer arrives in
// pieces. Yields the opening of the forms ReadEdif looks for, and the tokens after them.
class EdifParser::KeywordScanner {
 public:
  enum class Event { kEnd, kLibrary, kCell, kDesign, kPart, kPartition };
  enum class Parens { kStop, kSkip };

  explicit KeywordScanner(std::FILE* input) : input_(input) {}

  Event NextEvent() {
    for (;;) {
      int c = Get();
      if (c == EOF) return Event::kEnd;
      if (c != '(') continue;
      do c = Get();
      while (c == ' ' || c == '\t' || c == '\n' || c == '\r');
      if (c == EOF) return Event::kEnd;
      if (c == '(') {
        Unget();
        continue;
      }
      Event event = Event::kEnd;
      if (!MatchKeyword(c, event)) continue;
      if (event != Event::kPart) return event;
      std::string kind = NextToken(Parens::kStop);
      if (EqualsIgnoringCase(kind, "part")) return Event::kPart;
      if (EqualsIgnoringCase(kind, "partition")) return Event::kPartition;
    }
  }

  // The next run of non-blank characters. With kStop a parenthesis ends the token and is left for
  // the next one (a parenthesis alone is a token); with kSkip parentheses are dropped.
  std::string NextToken(Parens parens) {
    int c = Get();
    while (c != EOF && std::isspace(c)) c = Get();
    std::string token;
    bool truncated = false;
    for (; c != EOF && !std::isspace(c); c = Get()) {
      if (c == '(' || c == ')') {
        if (parens == Parens::kSkip) continue;
        if (token.empty()) return std::string(1, static_cast<char>(c));
        Unget();
        break;
      }
      if (token.size() < kMaxTokenLength) {
        token += static_cast<char>(c);
      } else {
        truncated = true;
      }
    }
    if (truncated) ReportTruncation(token);
    return token;
  }

 private:
  static constexpr std::size_t kLineBufferSize = 8000;
  static constexpr std::size_t kMaxTokenLength = 1023;

  struct Keyword {
    char first;
    std::string_view word;
    Event event;
  };

  // After "(" and `first`: the rest of one of the keywords, in either letter case per character,
  // and a delimiter, which is consumed.
  bool MatchKeyword(int first, Event& event) {
    static constexpr Keyword kKeywords[] = {{'c', "cell", Event::kCell},
                                            {'d', "design", Event::kDesign},
                                            {'l', "library", Event::kLibrary},
                                            {'p', "property", Event::kPart}};
    for (const Keyword& keyword : kKeywords) {
      if (std::tolower(first) != keyword.first) continue;
      for (std::size_t i = 1; i < keyword.word.size(); ++i) {
        int c = Get();
        if (c == EOF || std::tolower(c) != keyword.word[i]) return CancelAt(c);
      }
      int delimiter = Get();
      if (delimiter != ' ' && delimiter != '\t' && delimiter != '\n' && delimiter != '\r' &&
          delimiter != '(' && delimiter != ')')
        return CancelAt(delimiter);
      event = keyword.event;
      return true;
    }
    return false;
  }

  // A "(" that breaks a keyword may open the next form.
  bool CancelAt(int c) {
    if (c == '(') Unget();
    return false;
  }

  int Get() {
    // A line holding a zero byte ends there.
    while (line_[position_] == '\0') {
      position_ = 0;
      if (!std::fgets(line_.data(), static_cast<int>(line_.size()), input_)) {
        line_[0] = '\0';
        return EOF;
      }
    }
    lastPosition_ = position_;
    return static_cast<unsigned char>(line_[position_++]);
  }

  // Steps back over the character Get returned last; it is still in the buffer.
  void Unget() { position_ = lastPosition_; }

  static void ReportTruncation(const std::string& token) {
    Port_MsgManData::createObject(kMessageCategory, kMessageSource, 0, kRevision)
        ->issueWarning(kTruncatedToken, token.c_str());
  }

  std::FILE* input_;
  std::array<char, kLineBufferSize> line_{};
  std::size_t position_ = 0;
  std::size_t lastPosition_ = 0;
};

const Port::XUID& EdifParser::TopModuleTypeId() {
  static const Port::XUID id{std::string_view("{8E6A8A42-F002-42fd-B41D-ACBD4C2B5496}")};
  return id;
}

void EdifParser::ReportError(const char* format, const char* text) {
  Port_MsgManData::createObject(kMessageCategory, kMessageSource, 0, kRevision)->issueError(format, text);
}

void EdifParser::ResetTables() {
  cells_.clear();
  library_.clear();
}

void EdifParser::RecordTopModules(CParserConfigHolder& holder, const Summary& summary) {
  for (const Port::StringBase& cell : summary.designCells)
    holder.AddModule(cell, 0, true, TopModuleTypeId(), Port::StringBase());
  holder.SetPart(summary.part);
}

int EdifParser::Parse(CParserConfigHolder& holder) {
  ResetTables();
  if (ReadSiblingHierarchyFile(holder)) return 1;
  Port::StringBase path;
  holder.GetFullPath(path);
  RecordTopModules(holder, ReadEdif(path, false));
  return 1;
}

bool EdifParser::ReadSiblingHierarchyFile(CParserConfigHolder& holder) {
  Port::StringBase baseName;
  holder.GetBaseName(baseName);
  if (baseName.IsEmpty()) return false;
  const std::string hierarchyPath = baseName.str() + kHierarchyExtension;
  std::error_code error;
  if (!std::filesystem::is_regular_file(hierarchyPath, error)) return false;
  holder.SetTypeIds(HierarchyFallbackTypeIds());
  qhParser(Port::StringBase(hierarchyPath), holder).Parse();
  return true;
}

EdifParser::Summary EdifParser::ReadEdif(const Port::StringBase& path, bool stopAtPartition) {
  Summary summary;
  std::FILE* input = std::fopen(path.c_str(), "r");
  if (!input) return summary;
  KeywordScanner scanner(input);
  for (KeywordScanner::Event event = scanner.NextEvent(); event != KeywordScanner::Event::kEnd;
       event = scanner.NextEvent()) {
    if (event == KeywordScanner::Event::kLibrary) {
      ReadLibrary(scanner);
    } else if (event == KeywordScanner::Event::kCell) {
      ReadCell(scanner);
    } else if (event == KeywordScanner::Event::kPart) {
      ReadPart(scanner, summary);
    } else if (event == KeywordScanner::Event::kDesign) {
      ReadDesign(scanner, summary);
    } else if (event == KeywordScanner::Event::kPartition) {
      summary.hasPartition = true;
      if (stopAtPartition) break;
    }
  }
  std::fclose(input);
  return summary;
}

void EdifParser::ReadLibrary(KeywordScanner& scanner) {
  std::string name = scanner.NextToken(KeywordScanner::Parens::kStop);
  if (name != "(") {
    library_ = name;
  } else if (scanner.NextToken(KeywordScanner::Parens::kStop) == "rename") {
    library_ = scanner.NextToken(KeywordScanner::Parens::kStop);
  }
}

void EdifParser::ReadCell(KeywordScanner& scanner) {
  std::string name = scanner.NextToken(KeywordScanner::Parens::kSkip);
  if (EqualsIgnoringCase(name, "rename")) {
    std::string edifName = scanner.NextToken(KeywordScanner::Parens::kSkip);
    std::string displayName = WithoutQuotes(scanner.NextToken(KeywordScanner::Parens::kSkip));
    scanner.NextToken(KeywordScanner::Parens::kSkip);
    cells_[edifName + "|" + library_] = displayName;
  } else {
    cells_[name + "|" + library_] = name;
  }
}

void EdifParser::ReadPart(KeywordScanner& scanner, Summary& summary) {
  if (EqualsIgnoringCase(scanner.NextToken(KeywordScanner::Parens::kSkip), "string"))
    summary.part = Port::StringBase(WithoutQuotes(scanner.NextToken(KeywordScanner::Parens::kSkip)));
}

void EdifParser::ReadDesign(KeywordScanner& scanner, Summary& summary) {
  if (scanner.NextToken(KeywordScanner::Parens::kStop) == "(") {
    for (int i = 0; i < 4; ++i) scanner.NextToken(KeywordScanner::Parens::kStop);
  }
  std::string word = scanner.NextToken(KeywordScanner::Parens::kSkip);
  if (!EqualsIgnoringCase(word, "cellref")) return;
  std::string key = scanner.NextToken(KeywordScanner::Parens::kSkip);
  if (EqualsIgnoringCase(scanner.NextToken(KeywordScanner::Parens::kSkip), "libraryref"))
    key += "|" + scanner.NextToken(KeywordScanner::Parens::kSkip);
  auto found = cells_.find(key);
  if (found != cells_.end() && !found->second.empty()) {
    summary.designCells.emplace_back(found->second);
  } else {
    ReportError(kMissingDesignCell, key.c_str());
  }
}

}  // namespace Vad
