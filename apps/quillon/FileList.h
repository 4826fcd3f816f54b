// Reads file lists as simulators write them: tokens separated by blanks, quotes grouping, comments
// (//, #, /* */), environment variables, nested lists (-f, -F) and the options that name include
// directories, macros, library directories and library files.
#pragma once

#include <functional>
#include <istream>
#include <optional>
#include <set>
#include <string>
#include <vector>

namespace quillon {

class FileList {
 public:
  // The whole text of a list file; false with a reason in `error` (empty when the file cannot be
  // opened at all).
  using ReadFile = std::function<bool(const std::string& path, std::string& text, std::string& error)>;
  // The value of an environment variable; unset when it has none.
  using Lookup = std::function<std::optional<std::string>(const std::string& name)>;

  // A path as given: relative to the current directory when it was given relative.
  struct Entry {
    std::string path;
    std::string library;  // empty: the default
    std::string plugin;   // empty: the one of the extension
    std::string where;    // "LIST:LINE: ", for messages about the entry
  };

  struct Contents {
    std::vector<Entry> sources;
    std::vector<Entry> libraryDirs;   // -y
    std::vector<Entry> libraryFiles;  // -v
    std::vector<std::string> defines;
    std::vector<std::string> includeDirs;
    std::vector<std::string> libraryExtensions;  // +libext+, with their dots
    std::vector<std::string> warnings;
  };

  static constexpr const char* kStandardInput = "-";
  static constexpr const char* kVerilogPlugin = "PLUGIN_Verilog";

  FileList(ReadFile read, Lookup lookup, std::istream& standardInput);

  // Reads the list `path` ("-" for standard input, which is read once) and the lists it names.
  // relativeToList (-F): the paths inside are relative to the list's directory. `library` and
  // `plugin` are in effect at the start. False with "FILE:LINE: reason" in `error`.
  bool Read(const std::string& path, bool relativeToList, const std::string& library,
            const std::string& plugin, Contents& out, std::string& error);

  // A +incdir+, +define+ or +libext+ token, relative to `baseDir` (empty: the current directory).
  // False with a reason in `error`; true with a warning that starts with `where` for an option
  // that changes nothing here.
  static bool TakePlusOption(const std::string& token, const std::string& baseDir, const std::string& where,
                             Contents& out, std::string& error);

  // `path` taken from `baseDir` unless absolute, without "." and ".." steps.
  static std::string Resolved(const std::string& path, const std::string& baseDir);

 private:
  struct Token {
    std::string text;
    int line = 0;
  };
  struct Frame;

  bool Open(const std::string& path, const std::string& baseDir, bool relativeToList, Frame& frame,
            std::string& error);
  bool Tokenize(const std::string& text, std::vector<Token>& tokens, int& line, std::string& error) const;
  bool ExpandVariable(const std::string& text, std::size_t& at, std::string& into, std::string& error) const;
  bool TakeToken(std::vector<Frame>& stack, std::set<std::string>& open, Contents& out, std::string& error);

  ReadFile read_;
  Lookup lookup_;
  std::istream& standardInput_;
  bool standardInputRead_ = false;
};

}  // namespace quillon
