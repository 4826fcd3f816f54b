// The command line of quillon: what to do, on which sources, and how to write the answer.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace quillon {

enum class Command { kUnits, kTree, kOrder, kPorts, kCheck, kFactories, kExport, kWatch };
enum class Format { kText, kJson, kDot };
enum class ColorMode { kAuto, kAlways, kNever };

// One argument that names sources, in command-line order, with the library and plug-in that the
// -l/--library and --plugin options before it put in effect (empty when none was given).
struct SourceArgument {
  // kFile also stands for a directory, a glob pattern or a +incdir+/+define+/+libext+ token;
  // kFileListRelative is -F, kLibraryDir -y, kLibraryFile --library-file (-v in a file list).
  enum class Kind { kFile, kProjectFile, kFileList, kFileListRelative, kLibraryDir, kLibraryFile };
  Kind kind = Kind::kFile;
  std::string path;
  std::string library;
  std::string plugin;
};

class Options {
 public:
  enum class Outcome { kRun, kHelpShown, kVersionAsked, kUsageError };

  // Fills `options` from the arguments. kUsageError comes with a one-line reason in `error`;
  // kHelpShown means a help text (the usage, a command's help, the manual page or the words for
  // shell completion) was written to standard output.
  static Outcome Parse(int argc, const char* const* argv, Options& options, std::string& error);

  // False when `value` holds the ';' that separates the entries of the module's macro and include
  // directory lists.
  static bool FitsList(std::string_view value) { return value.find(';') == std::string_view::npos; }

  Command command = Command::kUnits;
  std::string unit;  // the UNIT of `ports`
  std::vector<SourceArgument> sources;

  std::vector<std::string> defines;      // -D NAME[=VALUE]
  std::vector<std::string> includeDirs;  // -I DIR
  std::optional<std::string> target;
  std::optional<std::string> family;
  std::vector<std::pair<std::string, std::string>> properties;  // --property KEY=VALUE
  std::optional<unsigned> converterTimeout;                     // seconds; 0 for none

  std::string top;      // --top or --unit
  bool byUnit = false;  // --unit
  bool withLibrary = false;
  std::string exportTo;  // export --to FORMAT

  std::optional<std::size_t> depth;  // tree --depth N: levels shown below the first
  bool instancesOnly = false;        // tree --instances

  Format format = Format::kText;
  std::string outputPath;
  bool quiet = false;
  bool verbose = false;
  bool absolutePaths = false;  // --absolute: full paths even where relative ones were given
  ColorMode color = ColorMode::kAuto;

  // Diagnostics: libraries whose units are black boxes, black boxes as errors, and (for check)
  // warnings as errors.
  std::vector<std::string> externalLibraries;
  bool strict = false;
  bool warningsAsErrors = false;

  // --cache DIR; empty: .quillon beside the first project file, or no cache without one.
  std::string cacheDir;
  bool noCache = false;
  // The arguments as given, after the program name; what the result cache keys a run by.
  std::vector<std::string> arguments;
  // The command whose answer watch prints again whenever it changes: order, tree or check.
  Command watchView = Command::kOrder;
};

}  // namespace quillon
