// Host type identifier of the module that stands for a whole source file (single-module,
// associated-module, state-diagram and schematic sources).
#pragma once

#include "CitI.h"

namespace Vad::TypeIds {

QUILLON_XUID_FROM_TEXT(FileNamedModule, "{3E515CB2-8A29-45dd-860D-0C91C6E19881}")

}  // namespace Vad::TypeIds
