#include "AbelParser.h"

#include "CParserConfigHolder.h"
#include "ConverterRun.h"
#include "Port/InitObjects.h"
#include "qhParser.h"

namespace Vad {
namespace {

constexpr ConverterMessages kAbelConverterMessages{"Unable to run abelconv - Process Failed\n",
                                                   "Unable to run abelconv - Bad Command Line\n"};

}  // namespace

void ReadThroughAbelConverter(CParserConfigHolder& holder) {
  const SourceNames source(holder);
  const Port::StringBase outputName = source.baseName + ".hrf";
  Port::StringBase command;
  command.Format("abelconv \"%s\" -ohrf only", source.fileName.c_str());

  CurrentDirectoryScope inSourceDirectory(source.directory);
  RunConverter(command, kAbelConverterMessages);
  qhParser(outputName, holder).Parse();
}

int AbelParser::Parse(CParserConfigHolder& holder) {
  ReadThroughAbelConverter(holder);
  return 1;
}

}  // namespace Vad
