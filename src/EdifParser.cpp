#include "EdifParser.h"

#include "Port/InitObjects.h"

namespace Vad {

int EdifParser::Parse(CParserConfigHolder& holder) { return RecordNothing("EdifParser", holder); }

}  // namespace Vad
