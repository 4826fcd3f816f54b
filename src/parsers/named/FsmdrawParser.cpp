#include "FsmdrawParser.h"

#include "CParserConfigHolder.h"
#include "FileNamedModule.h"
#include "Port/InitObjects.h"

namespace Vad {

int FsmdrawParser::Parse(CParserConfigHolder& holder) {
  Port::StringBase baseName;
  holder.GetBaseName(baseName);
  holder.AddModule(baseName, 0, true, TypeIds::FileNamedModule(), Port::StringBase());
  return 1;
}

}  // namespace Vad
