// Compiles one Verilog file on its own: reads it, preprocesses it with a given incoming macro
// state and finds its modules.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "vci/VerilogFileResult.h"
#include "vci/VerilogFileStamp.h"
#include "vci/VerilogMacroTable.h"

namespace Hx_Vci {

class VerilogFileCompiler {
 public:
  struct Compiled {
    VerilogFileStamp stamp;  // of the file as it was read
    std::shared_ptr<const VerilogFileResult> result;
  };

  // `includeDirs` must outlive the compiler.
  explicit VerilogFileCompiler(const std::vector<std::string>& includeDirs) : includeDirs_(includeDirs) {}

  // `macros` (not null) is the state at the start of the file. Problems end up in the result's
  // messages; a result always comes back.
  Compiled Compile(const std::string& path, std::shared_ptr<const VerilogMacroTable> macros) const;

 private:
  const std::vector<std::string>& includeDirs_;
};

}  // namespace Hx_Vci
