// The Verilog data compiler library: one compiler per user, its VPI access object, handles,
// iterators and the procedural-interface constants.
#pragma once

#include <memory>

#include "vci/Hx_VciDataCompiler.h"
#include "vci/Hx_VpiAccess.h"
#include "vci/Hx_VpiConstants.h"
#include "vci/Hx_VpiIterator.h"
#include "vci/Hx_VpiObject.h"

namespace Hx_Vci {

std::unique_ptr<DataCompiler> create_data_compiler();

}  // namespace Hx_Vci
