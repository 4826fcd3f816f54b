// The loader of the timing primitive library "timecell", read through the simulation mapping file.
#pragma once

#include "CLibLoader.h"

namespace Vad {

struct TimecellLibrary;
using CTimecellLoader = TCellLibraryLoader<TimecellLibrary>;
extern template class TCellLibraryLoader<TimecellLibrary>;

}  // namespace Vad
