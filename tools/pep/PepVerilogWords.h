// The Verilog words the module reader tells apart.
#pragma once

#include "pep/PepToken.h"

namespace PepVerilogWords {

// A reserved word of Verilog or of the SystemVerilog subset seen in module headers and bodies.
bool IsKeyword(const PepToken& token);
// A name that can be a module, instance, port or parameter name: no keyword.
bool IsIdentifier(const PepToken& token);
bool IsDirection(const PepToken& token);
// Net types (wire, tri, ...) and variable types (reg, logic, integer, ...).
bool IsDataType(const PepToken& token);
// Types whose parameters carry no integer value: real, realtime, shortreal, string.
bool IsNonIntegerType(const PepToken& token);
// The direction code of input, output or inout (ref counts as inout).
int DirectionOf(const PepToken& token);

}  // namespace PepVerilogWords
