#include "VerilogParser.h"

#include "Port/InitObjects.h"

namespace Vad {

int VerilogParser::Parse(CParserConfigHolder& holder) { return RecordNothing("VerilogParser", holder); }

}  // namespace Vad
