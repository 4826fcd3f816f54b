#include "vci/Hx_VciDataCompiler.h"

namespace Hx_Vci {

DataCompiler::DataCompiler() = default;

DataCompiler::~DataCompiler() = default;

// No Verilog front end exists yet, so nothing compiles and the caller records nothing.
std::unique_ptr<Hx_VpiAccess> DataCompiler::compile(int, const char* const*) { return nullptr; }

}  // namespace Hx_Vci
