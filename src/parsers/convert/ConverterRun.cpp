#include "ConverterRun.h"

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <limits>

#include "CParserConfigHolder.h"
#include "Port/File.h"
#include "Port/InitObjects.h"
#include "Port/InputLimits.h"
#include "Port/MsgManData.h"
#include "Port/Process.h"

namespace Vad {
namespace {

constexpr const char* kMessageCategory = "ProjectMgmt";
constexpr const char* kMessageSource = "../src/ConverterRun";
constexpr const char* kRevision = "1.1";

std::unique_ptr<Port_MsgManData> MessageSource() {
  return Port_MsgManData::createObject(kMessageCategory, kMessageSource, __LINE__, kRevision);
}

constexpr int kHighestSignal = 64;

unsigned TimeLimitOf(const CParserConfigHolder& holder) {
  Port::StringBase value;
  unsigned seconds = Port::InputLimits::kDefaultConverterSeconds;
  if (holder.GetProperty(Port::StringBase(Port::InputLimits::kConverterTimeoutProperty), value) ==
          CitI::kOk &&
      !value.IsEmpty()) {
    char* end = nullptr;
    unsigned long parsed = std::strtoul(value.c_str(), &end, 10);
    if (end && *end == '\0' && parsed <= std::numeric_limits<unsigned>::max())
      seconds = static_cast<unsigned>(parsed);
  }
  return seconds;
}

std::string StatusText(const std::string& program, int status, unsigned seconds) {
  char text[160];
  if (status == Port::Process::kTimedOut) {
    std::snprintf(text, sizeof text, Port::InputLimits::kConverterTimedOut, program.c_str(), seconds);
  } else if (status == Port::Process::kNotStarted) {
    std::snprintf(text, sizeof text, "%s could not be started (not found or not executable)",
                  program.c_str());
  } else if (status > Port::Process::kSignalBase && status <= Port::Process::kSignalBase + kHighestSignal) {
    std::snprintf(text, sizeof text, "%s was ended by signal %d", program.c_str(),
                  status - Port::Process::kSignalBase);
  } else {
    std::snprintf(text, sizeof text, "%s exited with status %d", program.c_str(), status);
  }
  return text;
}

}  // namespace

SourceNames::SourceNames(const CParserConfigHolder& holder) {
  holder.GetFullPath(fullPath);
  holder.GetBaseName(baseName);
  holder.GetFileName(fileName);
  directory = fullPath;
  if (fullPath.EndsWith(fileName.view())) directory.Truncate(fullPath.Length() - fileName.Length());
}

int RunConverter(const CParserConfigHolder& holder, const std::vector<std::string>& arguments,
                 const ConverterMessages& messages, Port::ChildOutput* sink) {
  const unsigned seconds = TimeLimitOf(holder);
  const int status = Port::Process::RunCaptured(arguments, seconds, sink);
  if (status == 0) return status;
  Port::StringBase source;
  holder.GetFullPath(source);
  Port::StringBase text(status == 1 ? messages.processFailed : messages.badCommandLine);
  if (text.EndsWith("\n")) text.Truncate(text.Length() - 1);
  text.AppendFormat(" (%s: %s)\n", source.c_str(), StatusText(arguments[0], status, seconds).c_str());
  IssueConverterError(text);
  return status;
}

bool ConverterOutputUsable(const char* tool, const Port::StringBase& source, const Port::StringBase& output,
                           int status) {
  if (!Port::File::exist(output.c_str())) {
    IssueConverterError(
        Port::StringBase().Format("%s wrote no output %s for %s\n", tool, output.c_str(), source.c_str()));
    return false;
  }
  std::int64_t outputTime = 0;
  std::int64_t sourceTime = 0;
  if (status != 0 && Port::File::getdatetime(output.c_str(), &outputTime) &&
      Port::File::getdatetime(source.c_str(), &sourceTime) && outputTime < sourceTime) {
    IssueConverterWarning(Port::StringBase().Format("%s is older than %s and is not read, as %s failed\n",
                                                    output.c_str(), source.c_str(), tool));
    return false;
  }
  return true;
}

Port::StringBase NoNetlistDatabaseText(const char* path) {
  std::FILE* file = std::fopen(path, "rb");
  if (!file) return Port::StringBase().Format("Could not open %s: %s\n", path, std::strerror(errno));
  std::fclose(file);
  return Port::StringBase().Format("%s is no netlist database\n", path);
}

void IssueConverterError(const Port::StringBase& text) { MessageSource()->issueError("%s", text.c_str()); }

void IssueConverterWarning(const Port::StringBase& text) {
  MessageSource()->issueWarning("%s", text.c_str());
}

CurrentDirectoryScope::CurrentDirectoryScope(const Port::StringBase& directory) {
  if (directory.IsEmpty() || !Port::File::getcwd(&saved_)) return;
  changed_ = Port::File::chdir(directory.c_str());
  if (!changed_) {
    Port_MsgManData::debugStub("WARNING: cannot change to the source directory %s\n", directory.c_str());
  }
}

CurrentDirectoryScope::~CurrentDirectoryScope() {
  if (changed_ && !Port::File::chdir(saved_.c_str())) {
    Port_MsgManData::debugStub("WARNING: cannot change back to %s\n", saved_.c_str());
  }
}

}  // namespace Vad
