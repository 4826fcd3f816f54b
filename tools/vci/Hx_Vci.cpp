#include "vci/Hx_Vci.h"

namespace Hx_Vci {

std::unique_ptr<DataCompiler> create_data_compiler() { return std::make_unique<DataCompiler>(); }

}  // namespace Hx_Vci
