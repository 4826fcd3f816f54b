#include "ConverterRun.h"

#include "CParserConfigHolder.h"
#include "Port/File.h"
#include "Port/InitObjects.h"
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

}  // namespace

SourceNames::SourceNames(const CParserConfigHolder& holder) {
  holder.GetFullPath(fullPath);
  holder.GetBaseName(baseName);
  holder.GetFileName(fileName);
  directory = fullPath;
  if (fullPath.EndsWith(fileName.view())) directory.Truncate(fullPath.Length() - fileName.Length());
}

int RunConverter(const Port::StringBase& command, const ConverterMessages& messages,
                 Port::ChildOutput* sink) {
  const int status = Port::Process::RunNoWindow(command, true, true, sink);
  if (status == 1) {
    IssueConverterError(messages.processFailed);
  } else if (status != 0) {
    IssueConverterError(messages.badCommandLine);
  }
  return status;
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
