// A Verilog data compiler: compiles the files of a command line and offers the result through a
// VPI access object. Create it with Hx_Vci::create_data_compiler.
#pragma once

#include <memory>

#include "vci/Hx_VpiAccess.h"

namespace Hx_Vci {

class DataCompiler {
 public:
  DataCompiler();
  DataCompiler(const DataCompiler&) = delete;
  DataCompiler& operator=(const DataCompiler&) = delete;
  ~DataCompiler();

  // `argv` holds `argc` texts: the command name, the Verilog files in compile order and the
  // options (+define+, +incdir+, and others that are accepted and ignored). Answers the compiled
  // design, ready for queries, or none when it could not be compiled.
  std::unique_ptr<Hx_VpiAccess> compile(int argc, const char* const* argv);
};

}  // namespace Hx_Vci
