#include "EdifParserPlx.h"

#include "Port/InitObjects.h"

namespace Vad {

int EdifParserPlx::Parse(CParserConfigHolder& holder) { return RecordNothing("EdifParserPlx", holder); }

}  // namespace Vad
