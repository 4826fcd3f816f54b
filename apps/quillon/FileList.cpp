#include "FileList.h"

#include <algorithm>
#include <array>
#include <cctype>
#include <filesystem>
#include <iterator>
#include <set>
#include <string_view>

#include "Options.h"

namespace quillon {

namespace {

constexpr std::string_view kIncdirPrefix = "+incdir+";
constexpr std::string_view kDefinePrefix = "+define+";
constexpr std::string_view kLibextPrefix = "+libext+";
constexpr std::string_view kStandardInputName = "standard input";

// Simulator options that change how a design runs, not which sources it has: they are passed
// over with a warning, so that lists written for a simulator can be read as they are.
constexpr std::array<std::string_view, 6> kHarmlessOptions = {"+notimingchecks", "+nospecify", "+acc",
                                                              "-quiet",          "-64",        "-mfcu"};

// True, with a warning naming the place, when `token` is one of those options.
bool PassesOverHarmless(const std::string& token, const std::string& where,
                        std::vector<std::string>& warnings) {
  if (std::find(kHarmlessOptions.begin(), kHarmlessOptions.end(), token) == kHarmlessOptions.end())
    return false;
  warnings.push_back(where + "the simulator option " + token + " changes nothing here; it is ignored");
  return true;
}

bool IsBlank(char c) { return c == ' ' || c == '\t' || c == '\r' || c == '\f' || c == '\v'; }

bool IsNameCharacter(char c) { return std::isalnum(static_cast<unsigned char>(c)) != 0 || c == '_'; }

std::vector<std::string> PlusSeparated(std::string_view list) {
  std::vector<std::string> pieces;
  std::size_t start = 0;
  while (start <= list.size()) {
    std::size_t plus = list.find('+', start);
    if (plus == std::string_view::npos) plus = list.size();
    if (plus > start) pieces.emplace_back(list.substr(start, plus - start));
    start = plus + 1;
  }
  return pieces;
}

bool RefuseSemicolon(const std::string& value, std::string& error) {
  if (Options::FitsList(value)) return false;
  error = "'" + value + "' holds a ';', which would separate it into more than one entry";
  return true;
}

// Where a -F list's relative paths start: the list's own directory, as it was given.
std::string DirectoryOf(const std::string& path) {
  return std::filesystem::path(path).parent_path().string();
}

std::string IdentityOf(const std::string& path) {
  if (path == FileList::kStandardInput) return path;
  std::error_code failure;
  std::filesystem::path absolute = std::filesystem::absolute(path, failure);
  return (failure ? std::filesystem::path(path) : absolute).lexically_normal().string();
}

// An option where a value is due means the value is missing ("-l" at the end of its line): no
// library, list or path is spelled "-sv" or "+incdir+...". A lone "-" is standard input.
bool IsOption(const std::string& token) { return token.size() > 1 && (token[0] == '-' || token[0] == '+'); }

}  // namespace

struct FileList::Frame {
  std::string name;     // for messages
  std::string key;      // the list's full path: a list must not include itself
  std::string baseDir;  // where relative paths inside start; empty: the current directory
  std::vector<Token> tokens;
  std::size_t next = 0;
  std::string library;
  std::string plugin;

  std::string Where(int line) const { return name + ":" + std::to_string(line) + ": "; }
};

FileList::FileList(ReadFile read, Lookup lookup, std::istream& standardInput)
    : read_(std::move(read)), lookup_(std::move(lookup)), standardInput_(standardInput) {}

std::string FileList::Resolved(const std::string& path, const std::string& baseDir) {
  std::filesystem::path resolved(path);
  if (!baseDir.empty() && resolved.is_relative()) resolved = std::filesystem::path(baseDir) / resolved;
  std::string normal = resolved.lexically_normal().string();
  return normal.empty() ? std::string(".") : normal;
}

bool FileList::Read(const std::string& path, bool relativeToList, const std::string& library,
                    const std::string& plugin, Contents& out, std::string& error) {
  Frame first;
  first.library = library;
  first.plugin = plugin;
  if (!Open(path, "", relativeToList, first, error)) return false;
  std::vector<Frame> stack;
  std::set<std::string> open;  // the keys of the lists on the stack
  open.insert(first.key);
  stack.push_back(std::move(first));
  while (!stack.empty()) {
    if (stack.back().next == stack.back().tokens.size()) {
      open.erase(stack.back().key);
      stack.pop_back();
    } else if (!TakeToken(stack, open, out, error)) {
      return false;
    }
  }
  return true;
}

bool FileList::Open(const std::string& path, const std::string& baseDir, bool relativeToList, Frame& frame,
                    std::string& error) {
  std::string text;
  if (path == kStandardInput) {
    if (standardInputRead_) {
      error = "standard input is read once; it is named as a list twice";
      return false;
    }
    standardInputRead_ = true;
    text.assign(std::istreambuf_iterator<char>(standardInput_), std::istreambuf_iterator<char>());
    frame.name = kStandardInputName;
    frame.key = kStandardInput;
  } else {
    frame.name = Resolved(path, baseDir);
    frame.key = IdentityOf(frame.name);
    if (!read_(frame.name, text, error)) {
      if (error.empty()) error = "cannot read file list " + frame.name;
      return false;
    }
    if (relativeToList) frame.baseDir = DirectoryOf(frame.name);
  }
  constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";
  if (text.starts_with(kByteOrderMark)) text.erase(0, kByteOrderMark.size());
  int line = 1;
  if (!Tokenize(text, frame.tokens, line, error)) {
    error = frame.Where(line) + error;
    return false;
  }
  return true;
}

// Blanks separate tokens; quotes group blanks into a token; a comment starts where a token could.
// $VAR, ${VAR} and $(VAR) are replaced outside single quotes.
bool FileList::Tokenize(const std::string& text, std::vector<Token>& tokens, int& line,
                        std::string& error) const {
  std::size_t at = 0;
  while (at < text.size()) {
    char c = text[at];
    if (c == '\n') {
      ++line;
      ++at;
    } else if (IsBlank(c)) {
      ++at;
    } else if (text.compare(at, 2, "//") == 0 || c == '#') {
      at = std::min(text.find('\n', at), text.size());
    } else if (text.compare(at, 2, "/*") == 0) {
      std::size_t end = text.find("*/", at + 2);
      if (end == std::string::npos) {
        error = "a /* comment is not closed";
        return false;
      }
      line += static_cast<int>(std::count(text.begin() + static_cast<std::ptrdiff_t>(at),
                                          text.begin() + static_cast<std::ptrdiff_t>(end), '\n'));
      at = end + 2;
    } else {
      Token token{"", line};
      while (at < text.size() && text[at] != '\n' && !IsBlank(text[at])) {
        char quote = text[at];
        if (quote == '\'' || quote == '"') {
          std::size_t close = text.find_first_of(std::string(1, quote) + "\n", at + 1);
          if (close == std::string::npos || text[close] != quote) {
            error = std::string("a ") + quote + " quote is not closed on its line";
            return false;
          }
          for (++at; at < close;) {
            if (quote == '"' && text[at] == '$') {
              if (!ExpandVariable(text, at, token.text, error)) return false;
            } else {
              token.text += text[at++];
            }
          }
          at = close + 1;
        } else if (quote == '$') {
          if (!ExpandVariable(text, at, token.text, error)) return false;
        } else {
          token.text += text[at++];
        }
      }
      tokens.push_back(std::move(token));
    }
  }
  return true;
}

bool FileList::ExpandVariable(const std::string& text, std::size_t& at, std::string& into,
                              std::string& error) const {
  std::size_t start = at + 1;
  char open = start < text.size() ? text[start] : '\0';
  char close = open == '{' ? '}' : open == '(' ? ')' : '\0';
  std::size_t nameStart = close ? start + 1 : start;
  std::size_t nameEnd = nameStart;
  while (nameEnd < text.size() && IsNameCharacter(text[nameEnd])) ++nameEnd;
  if (close && (nameEnd >= text.size() || text[nameEnd] != close)) {
    error =
        "the variable after '$" + std::string(1, open) + "' is not closed by '" + std::string(1, close) + "'";
    return false;
  }
  if (nameEnd == nameStart) {  // a lone '$' is part of the path
    into += '$';
    ++at;
    return true;
  }
  std::string name = text.substr(nameStart, nameEnd - nameStart);
  std::optional<std::string> value = lookup_(name);
  if (!value) {
    error = "the environment variable " + name + " is not set";
    return false;
  }
  into += *value;
  at = close ? nameEnd + 1 : nameEnd;
  return true;
}

bool FileList::TakeToken(std::vector<Frame>& stack, std::set<std::string>& open, Contents& out,
                         std::string& error) {
  Frame& frame = stack.back();
  const Token& token = frame.tokens[frame.next++];
  const std::string& text = token.text;
  const std::string where = frame.Where(token.line);
  if (text == "-f" || text == "-F" || text == "-y" || text == "-v" || text == "-l") {
    if (frame.next == frame.tokens.size() || IsOption(frame.tokens[frame.next].text)) {
      error = where + text + " needs a value";
      return false;
    }
    const std::string& value = frame.tokens[frame.next++].text;
    Entry entry{value == kStandardInput ? value : Resolved(value, frame.baseDir), frame.library, frame.plugin,
                where};
    if (text == "-l") {
      frame.library = value;
    } else if (text == "-y") {
      out.libraryDirs.push_back(std::move(entry));
    } else if (text == "-v") {
      out.libraryFiles.push_back(std::move(entry));
    } else {
      Frame nested;
      nested.library = frame.library;
      nested.plugin = frame.plugin;
      if (!Open(entry.path, "", text == "-F", nested, error)) {
        error = where + error;
        return false;
      }
      if (!open.insert(nested.key).second) {
        error = where + "the list " + nested.name + " includes itself";
        return false;
      }
      stack.push_back(std::move(nested));  // `frame` and `token` are not used past this point
    }
    return true;
  }
  if (text == "-sv") {
    frame.plugin = kVerilogPlugin;
    return true;
  }
  if (text[0] == '+') {
    if (TakePlusOption(text, frame.baseDir, where, out, error)) return true;
    error = where + error;
    return false;
  }
  if (text.size() > 1 && text[0] == '-') {
    if (PassesOverHarmless(text, where, out.warnings)) return true;
    error = where + "unknown list option " + text;
    return false;
  }
  out.sources.push_back({Resolved(text, frame.baseDir), frame.library, frame.plugin, where});
  return true;
}

bool FileList::TakePlusOption(const std::string& token, const std::string& baseDir, const std::string& where,
                              Contents& out, std::string& error) {
  auto valuesAfter = [&](std::string_view prefix) {
    return PlusSeparated(std::string_view(token).substr(prefix.size()));
  };
  if (token.starts_with(kIncdirPrefix)) {
    for (const std::string& directory : valuesAfter(kIncdirPrefix)) {
      if (RefuseSemicolon(directory, error)) return false;
      out.includeDirs.push_back(Resolved(directory, baseDir));
    }
  } else if (token.starts_with(kDefinePrefix)) {
    for (std::string& define : valuesAfter(kDefinePrefix)) {
      if (RefuseSemicolon(define, error)) return false;
      if (define[0] == '=') {
        error = "+define+ needs NAME[=VALUE], not '" + define + "'";
        return false;
      }
      out.defines.push_back(std::move(define));
    }
  } else if (token.starts_with(kLibextPrefix)) {
    for (std::string& extension : valuesAfter(kLibextPrefix))
      out.libraryExtensions.push_back(extension[0] == '.' ? extension : "." + extension);
  } else if (!PassesOverHarmless(token, where, out.warnings)) {
    error = "unknown list option " + token;
    return false;
  }
  return true;
}

}  // namespace quillon
