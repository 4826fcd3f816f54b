#include "HrfParser.h"

#include "Port/InitObjects.h"

namespace Vad {

int HrfParser::Parse(CParserConfigHolder& holder) { return RecordNothing("HrfParser", holder); }

}  // namespace Vad
