#include "jpParser.h"

#include <cerrno>
#include <cstring>

#include "Port/File.h"
#include "Port/StringBase.h"
#include "VhdlParseContext.h"

namespace Vad {

jpParser::jpParser(const Port::StringBase& path) {
  errno = 0;
  input_ = Port::File::open(path.c_str(), "rb");
  // A directory opens but is refused afterwards without an error number: no reason then.
  if (!input_ && errno != 0) openFailureReason_ = std::strerror(errno);
}

jpParser::~jpParser() { Port::File::close(input_); }

bool jpParser::Run(CParserConfigHolder& holder, bool synthesisTarget) {
  if (!input_) return true;
  VhdlParseContext context(holder, *input_, synthesisTarget);
  const bool completed = RunVhdlGrammar(context);
  syntaxError_ = context.structure.FirstFault();
  return completed;
}

}  // namespace Vad
