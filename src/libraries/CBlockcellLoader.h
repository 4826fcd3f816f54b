// The loader of the macro library "blockcell", read through the synthesis mapping file.
#pragma once

#include "CLibLoader.h"

namespace Vad {

struct BlockcellLibrary;
using CBlockcellLoader = TCellLibraryLoader<BlockcellLibrary>;
extern template class TCellLibraryLoader<BlockcellLibrary>;

}  // namespace Vad
