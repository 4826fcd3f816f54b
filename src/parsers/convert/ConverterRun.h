// What the parsers that read sources through an external converter share: the source's names,
// running the converter with its failure messages, and working inside the source's directory.
#pragma once

#include <string>
#include <vector>

#include "Port/ChildOutput.h"
#include "Port/StringBase.h"

namespace Vad {

class CParserConfigHolder;

// The names of the holder's source file.
struct SourceNames {
  explicit SourceNames(const CParserConfigHolder& holder);

  Port::StringBase fullPath;
  Port::StringBase baseName;  // without directory and extension
  Port::StringBase fileName;  // without directory
  // The full path with the file name removed (it keeps its trailing '/'); empty when the path
  // has no directory.
  Port::StringBase directory;
};

// The two messages a converter's failure is reported with.
struct ConverterMessages {
  const char* processFailed;
  const char* badCommandLine;
};

// Runs the converter `arguments` (the first names the program) without a shell, under the time
// limit of the project property Port::InputLimits::kConverterTimeoutProperty (default
// kDefaultConverterSeconds), and reports a failure with the tool's messages followed by the source
// file and what happened: the first message for status 1, the second for any other failure.
// `sink` (may be null) takes the tool's output and is owned by the call. The tool's status, or
// Port::Process::kTimedOut.
int RunConverter(const CParserConfigHolder& holder, const std::vector<std::string>& arguments,
                 const ConverterMessages& messages, Port::ChildOutput* sink = nullptr);

// Whether the converter's `output` for `source` is to be read after a run that ended with
// `status`: a missing output is an error; after a failed run, an output older than the source is
// left with a warning, as it does not reflect the source.
bool ConverterOutputUsable(const char* tool, const Port::StringBase& source, const Port::StringBase& output,
                           int status);

// The message for a `path` that the netlist database reader refuses: "Could not open" with the
// reason only when the file cannot be opened.
Port::StringBase NoNetlistDatabaseText(const char* path);

// Issues one finished message text of the converter parsers (category "ProjectMgmt").
void IssueConverterError(const Port::StringBase& text);
void IssueConverterWarning(const Port::StringBase& text);

// Changes the current directory for one scope and always changes back, also when the scope is
// left by an exception. An empty directory leaves the current one as it is.
class CurrentDirectoryScope {
 public:
  explicit CurrentDirectoryScope(const Port::StringBase& directory);
  ~CurrentDirectoryScope();
  CurrentDirectoryScope(const CurrentDirectoryScope&) = delete;
  CurrentDirectoryScope& operator=(const CurrentDirectoryScope&) = delete;

 private:
  Port::StringBase saved_;
  bool changed_ = false;
};

}  // namespace Vad
