#include "AbelParser.h"

#include "Port/InitObjects.h"

namespace Vad {

int AbelParser::Parse(CParserConfigHolder& holder) { return RecordNothing("AbelParser", holder); }

}  // namespace Vad
