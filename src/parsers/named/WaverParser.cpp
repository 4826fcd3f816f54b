#include "WaverParser.h"

#include "Port/InitObjects.h"

namespace Vad {

int WaverParser::Parse(CParserConfigHolder&) { return 0; }

}  // namespace Vad
