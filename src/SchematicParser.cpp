#include "SchematicParser.h"

#include "Port/InitObjects.h"

namespace Vad {

int SchematicParser::Parse(CParserConfigHolder& holder) { return RecordNothing("SchematicParser", holder); }

}  // namespace Vad
