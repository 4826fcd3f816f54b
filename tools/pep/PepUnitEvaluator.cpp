#include "pep/PepUnitEvaluator.h"

PepUnitEvaluator::PepUnitEvaluator(const PepDesignUnit& unit)
    : unit_(unit), evaluator_(unit.language, [this](const std::string& key) -> std::optional<std::int64_t> {
        auto found = values_.find(key);
        return found == values_.end() ? std::nullopt : found->second;
      }) {
  EvaluateConstants();
}

void PepUnitEvaluator::EvaluateConstants() {
  for (const PepConstant& constant : unit_.constants) {
    std::optional<std::int64_t> value;
    if (constant.hasDefault) value = evaluator_.Evaluate(constant.defaultValue);
    // Assigned after evaluating, so a default that names its own constant finds no value.
    values_[constant.key] = value;
    // A default the evaluator cannot compute (a concatenation, a macro, a function it does not
    // know) still gives the generic a value: only the ranges that use it stay unknown.
    if (constant.isGeneric && !constant.hasDefault) allGenericsDefined_ = false;
  }
}

std::vector<PepPort> PepUnitEvaluator::Ports() const {
  std::vector<PepPort> ports;
  ports.reserve(unit_.ports.size());
  for (const PepPortDeclaration& declaration : unit_.ports) ports.push_back(EvaluatePort(declaration));
  return ports;
}

PepPort PepUnitEvaluator::EvaluatePort(const PepPortDeclaration& declaration) const {
  PepPort port;
  port.name = declaration.name;
  port.typeName = declaration.typeName;
  port.direction = declaration.direction;
  if (declaration.range) {
    std::optional<std::int32_t> left = evaluator_.Evaluate(declaration.range->left);
    std::optional<std::int32_t> right = evaluator_.Evaluate(declaration.range->right);
    if (left && right) {
      port.left = *left;
      port.right = *right;
      port.hasRange = true;
    }
  }
  return port;
}
