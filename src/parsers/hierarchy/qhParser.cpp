#include "qhParser.h"

#include <cstdarg>
#include <cstdio>

#include "HierarchyParseContext.h"
#include "Port/File.h"
#include "Port/MsgManData.h"
#include "Port/StringBase.h"

namespace Vad {
namespace {

constexpr const char* kMessageCategory = "ProjectMgmt";

}  // namespace

void HierarchyParseContext::Error(const char* format, ...) {
  std::va_list args;
  va_start(args, format);
  Port::StringBase text;
  text.FormatV(format, args);
  va_end(args);
  Port_MsgManData::createObject(kMessageCategory, path.c_str(), static_cast<int>(tokenLine), "")
      ->issueError("%s:%u: %s\n", path.c_str(), tokenLine, text.c_str());
}

qhParser::qhParser(const Port::StringBase& path, CParserConfigHolder& holder)
    : input_(Port::File::open(path.c_str(), "r")), path_(path.str()), holder_(holder) {}

qhParser::~qhParser() { Port::File::close(input_); }

int qhParser::Parse() {
  if (!input_) {
    std::fputs(kFileNotFound, stdout);
    std::fflush(stdout);
    return 0;
  }
  HierarchyParseContext context(holder_, *input_, path_);
  const int result = RunHierarchyGrammar(context);
  if (input_->error()) context.Error("the file could not be read to its end");
  return result;
}

}  // namespace Vad
