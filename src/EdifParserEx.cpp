#include "EdifParserEx.h"

#include "Port/InitObjects.h"

namespace Vad {

int EdifParserEx::Parse(CParserConfigHolder& holder) { return RecordNothing("EdifParserEx", holder); }

}  // namespace Vad
