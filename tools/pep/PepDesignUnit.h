// What the readers record of a VHDL entity or Verilog module: its generics and parameters and its
// ports with their range expressions still unevaluated (PepUnitEvaluator evaluates them).
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "pep/PepToken.h"

// A VHDL generic, or a Verilog parameter or localparam.
struct PepConstant {
  std::string name;  // as written
  std::string key;   // what expressions refer to it by
  // Settable from outside the unit (generics, parameters): only these count for
  // hasAllGenericsDefined. Verilog localparams are not.
  bool isGeneric = true;
  bool hasDefault = false;
  // The default must evaluate to an integer for the constant to count as defined; false for
  // non-integer VHDL types and Verilog real, string and type parameters.
  bool needsValue = true;
  PepTokens defaultValue;
};

// The two bounds of a range as written: "L downto R", "L to R", [L:R].
struct PepRangeExpression {
  PepTokens left;
  PepTokens right;
};

struct PepPortDeclaration {
  std::string name;
  std::string key;
  std::string typeName;
  int direction = 0;  // PepPort::kDirection*
  std::optional<PepRangeExpression> range;
  bool typeWritten = false;  // Verilog: a net or variable declaration may still refine the type
};

struct PepDesignUnit {
  PepLanguage language = PepLanguage::kVhdl;
  std::string library;                 // lower case
  std::string name;                    // as written
  std::string key;                     // VHDL: lower case
  std::vector<PepConstant> constants;  // in declaration order, later ones may use earlier ones
  std::vector<PepPortDeclaration> ports;
};

// One unit (ownerKey) instantiating another (unitKey) by name.
struct PepInstanceReference {
  PepLanguage language = PepLanguage::kVhdl;
  std::string ownerKey;
  std::string unitKey;
};
