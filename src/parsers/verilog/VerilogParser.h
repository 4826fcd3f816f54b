// Finds the modules of a Verilog source file and the module instances inside each: the Verilog
// data compiler compiles the file after the project's Verilog files before it, and the compiled
// design is walked through the compiler's VPI access object.
#pragma once

#include <memory>

#include "CitI.h"
#include "Parser.h"
#include "Port/StringBase.h"

class Hx_VpiAccess;
namespace Hx_Vci {
class DataCompiler;
}

namespace Vad {

// Type identifiers that the Verilog parser gives the holder for what it records (host constants).
namespace VerilogTypeIds {
QUILLON_XUID_FROM_TEXT(Module, "{EFF68E5D-D682-463e-8CA1-A045C09E5B6F}")
QUILLON_XUID_FROM_TEXT(ModuleInstance, "{4767A2DD-D3AE-4b52-9042-59EAAF25C023}")
}  // namespace VerilogTypeIds

class VerilogParser : public Parser {
 public:
  // Creates the parser's own compiler; without memory for it, Parse records nothing.
  VerilogParser();
  ~VerilogParser() override;

  // Compiles the holder's file (see VerilogArguments) with every message of the compiler
  // captured, then records each module of the file and the module instances inside it. A file
  // that does not compile records nothing. Always 0.
  int Parse(CParserConfigHolder& holder) override;

  // The ports of a module: the port extractor reads only the holder's file and is asked for the
  // module by name, so a module that others instantiate gets its own ports. Results as for
  // VhdlParser::ExtractPorts.
  CitI::Result ExtractPorts(CParserConfigHolder& holder, IHdlDesignUnit* unit,
                            IHdlPortIterator** ports) override;

  // The compiler's messages during the last Parse, which the user does not see.
  const Port::StringBase& CapturedMessages() const { return capturedMessages_; }

 private:
  static void RecordModules(const Hx_VpiAccess& access, CParserConfigHolder& holder);

  std::unique_ptr<Hx_Vci::DataCompiler> compiler_;
  Port::StringBase capturedMessages_;
};

}  // namespace Vad
