// Evaluates the integer expressions of ranges and generic defaults: integer literals, names of
// constants (through a lookup), + - * / ** parentheses, unary + - (and abs in VHDL), VHDL mod and
// rem; in Verilog also %, << >>, comparisons, && ||, ?: and $clog2. Anything else (other function
// calls, attributes, macros, reals, strings) makes the expression unevaluable, and so do division by zero and
// results outside 64 bits on the way or outside 32 bits at the end. Nesting deeper than kMaxDepth is
// unevaluable too, so that the recursion stays shallow whatever the input.
#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <string>

#include "pep/PepToken.h"

class PepExpressionEvaluator {
 public:
  static constexpr int kMaxDepth = 64;

  // The value of the constant with that key, none when it is unknown or has no value.
  using Lookup = std::function<std::optional<std::int64_t>(const std::string& key)>;

  PepExpressionEvaluator(PepLanguage language, Lookup lookup)
      : language_(language), lookup_(std::move(lookup)) {}

  std::optional<std::int32_t> Evaluate(const PepTokens& tokens) const;

 private:
  PepLanguage language_;
  Lookup lookup_;
};
