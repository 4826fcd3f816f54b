#include "qhParser.h"

#include <cstdio>

#include "HierarchyParseContext.h"
#include "Port/File.h"
#include "Port/StringBase.h"

namespace Vad {

qhParser::qhParser(const Port::StringBase& path, CParserConfigHolder& holder)
    : input_(Port::File::open(path.c_str(), "r")), holder_(holder) {}

qhParser::~qhParser() { Port::File::close(input_); }

int qhParser::Parse() {
  if (!input_) {
    std::fputs(kFileNotFound, stdout);
    std::fflush(stdout);
    return 0;
  }
  HierarchyParseContext context(holder_, *input_);
  return RunHierarchyGrammar(context);
}

}  // namespace Vad
