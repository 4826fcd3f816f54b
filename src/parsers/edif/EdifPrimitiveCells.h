// The primitive cells of the device netlists: instances of these cells are not design units.
#pragma once

#include <string_view>

namespace Vad::EdifPrimitiveCells {

// True when `cellName`, in any letter case, is a primitive cell.
bool Contains(std::string_view cellName);

}  // namespace Vad::EdifPrimitiveCells
