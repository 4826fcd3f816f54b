// Turns a unit as read into what the extractor reports: the value of every generic and parameter
// from its default, in declaration order (so a default may use the constants declared before it),
// then the ports with their range bounds evaluated over those values.
//
// A port whose range cannot be evaluated (unknown name, generic without default, function call,
// division by zero, overflow, a bound outside 32 bits) is reported with hasRange false and both
// bounds 0; its name, type and direction are still reported.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <unordered_map>
#include <vector>

#include "pep/PepDesignUnit.h"
#include "pep/PepExpressionEvaluator.h"
#include "pep/PepPort.h"

class PepUnitEvaluator {
 public:
  // `unit` must outlive the evaluator.
  explicit PepUnitEvaluator(const PepDesignUnit& unit);
  PepUnitEvaluator(const PepUnitEvaluator&) = delete;
  PepUnitEvaluator& operator=(const PepUnitEvaluator&) = delete;

  // True when every generic (not localparam) has a default, whether the evaluator can compute it
  // or not: a port whose range needs an uncomputable default comes without its range, the others
  // with theirs.
  bool AllGenericsDefined() const { return allGenericsDefined_; }
  std::vector<PepPort> Ports() const;

 private:
  void EvaluateConstants();
  PepPort EvaluatePort(const PepPortDeclaration& declaration) const;

  const PepDesignUnit& unit_;
  std::unordered_map<std::string, std::optional<std::int64_t>> values_;
  PepExpressionEvaluator evaluator_;
  bool allGenericsDefined_ = true;
};
