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
  CurrentDirectoryScope inSourceDirectory(source.directory);
  const int status =
      RunConverter(holder, {"abelconv", source.fileName.str(), "-ohrf", "only"}, kAbelConverterMessages);
  if (ConverterOutputUsable("abelconv", source.fileName, outputName, status))
    qhParser(outputName, holder).Parse();
}

int AbelParser::Parse(CParserConfigHolder& holder) {
  ReadThroughAbelConverter(holder);
  return 1;
}

}  // namespace Vad
