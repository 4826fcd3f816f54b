// The loader of the unified cell library "basecell", read through the synthesis mapping file.
#pragma once

#include "CLibLoader.h"

namespace Vad {

struct BasecellLibrary;
using CBasecellLoader = TCellLibraryLoader<BasecellLibrary>;
extern template class TCellLibraryLoader<BasecellLibrary>;

}  // namespace Vad
