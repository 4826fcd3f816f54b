#include "AbelVectorParser.h"

#include "Port/InitObjects.h"

namespace Vad {

int AbelVectorParser::Parse(CParserConfigHolder& holder) { return RecordNothing("AbelVectorParser", holder); }

}  // namespace Vad
