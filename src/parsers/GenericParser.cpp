#include "GenericParser.h"

#include "CParserConfigHolder.h"
#include "Port/InitObjects.h"

namespace Vad {
namespace {

QUILLON_XUID_FROM_TEXT(GenericUnitType, "{74F4DBA5-33FB-44d9-A3A9-0802BF3CFE35}")

}  // namespace

int GenericParser::Parse(CParserConfigHolder& holder) {
  Port::StringBase fileName;
  holder.GetFileName(fileName);
  holder.AddGeneric(fileName, 0, GenericUnitType());
  return 1;
}

}  // namespace Vad
