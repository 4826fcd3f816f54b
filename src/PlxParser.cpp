#include "PlxParser.h"

#include "Port/InitObjects.h"

namespace Vad {

int PlxParser::Parse(CParserConfigHolder& holder) { return RecordNothing("PlxParser", holder); }

}  // namespace Vad
