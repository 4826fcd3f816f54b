// Reads the comma-separated items of Verilog port, net and parameter declarations. Direction,
// type and range carry over from one item to the next as the language has it:
//   input wire [W-1:0] a, b      -> a and b: in, "wire", [W-1:0]
//   output reg q                 -> out, "reg", no range
//   input [3:0] c                -> in, "wire" (the type when none is written)
//   parameter W = 8, D = W * 2   -> two parameters
#pragma once

#include <optional>
#include <vector>

#include "pep/PepDesignUnit.h"
#include "pep/PepPort.h"

class PepVerilogDeclarations {
 public:
  // Ports (or, without a direction, nets and variables) declared by `items`; items that name
  // nothing are skipped.
  std::vector<PepPortDeclaration> ReadPorts(const std::vector<PepTokens>& items);
  // Appends the parameters declared by `items` to `unit`; "parameter" declares generics when
  // `parameterIsGeneric`, "localparam" never does. An item without either word continues the
  // previous one (a generic at the start).
  void ReadParameters(const std::vector<PepTokens>& items, bool parameterIsGeneric, PepDesignUnit& unit);

  // [L:R] at tokens[open]; a range that is no two bounds does not evaluate.
  static PepRangeExpression ReadPackedRange(const PepTokens& tokens, std::size_t open);

 private:
  std::optional<PepPortDeclaration> ReadPortItem(const PepTokens& item);
  void ReadParameterItem(const PepTokens& item, bool parameterIsGeneric, PepDesignUnit& unit);

  int direction_ = PepPort::kDirectionInOut;
  std::string typeName_ = "wire";
  bool typeWritten_ = false;
  std::optional<PepRangeExpression> range_;
  bool isGeneric_ = true;
  bool needsValue_ = true;
};
