#include "pep/PepExpressionEvaluator.h"

#include <array>
#include <limits>
#include <string_view>

namespace {

using Value = std::optional<std::int64_t>;

Value CheckedPower(std::int64_t base, std::int64_t exponent) {
  if (exponent < 0) return std::nullopt;
  if (base == 0 || base == 1) return exponent == 0 ? 1 : base;
  if (base == -1) return exponent % 2 == 0 ? 1 : -1;
  // |base| >= 2 overflows within 63 steps, so the loop is short whatever the exponent.
  std::int64_t result = 1;
  for (std::int64_t i = 0; i < exponent; ++i) {
    if (__builtin_mul_overflow(result, base, &result)) return std::nullopt;
  }
  return result;
}

// VHDL mod takes the sign of the divisor, rem (and Verilog %) that of the dividend.
Value CheckedDivision(std::int64_t left, std::int64_t right, char operation) {
  if (right == 0) return std::nullopt;
  if (right == -1) {
    if (left == std::numeric_limits<std::int64_t>::min()) return std::nullopt;
    return operation == '/' ? -left : 0;
  }
  if (operation == '/') return left / right;
  std::int64_t remainder = left % right;
  if (operation == 'm' && remainder != 0 && ((remainder < 0) != (right < 0))) remainder += right;
  return remainder;
}

Value CheckedShift(std::int64_t value, std::int64_t distance, bool left) {
  if (distance < 0) return std::nullopt;
  if (!left) return value >> (distance > 63 ? 63 : distance);
  if (distance > 62) return value == 0 ? Value(0) : std::nullopt;
  std::int64_t result = 0;
  if (__builtin_mul_overflow(value, std::int64_t{1} << distance, &result)) return std::nullopt;
  return result;
}

// Bits needed to tell `value` things apart: 0 for 0 and 1, then the ceiling of the logarithm.
Value CeilingLog2(std::int64_t value) {
  if (value < 0) return std::nullopt;
  std::int64_t bits = 0;
  while (bits < 63 && (std::int64_t{1} << bits) < value) ++bits;
  return bits;
}

Value ApplyVerilogOperator(std::string_view operation, std::int64_t left, std::int64_t right) {
  if (operation == "||") return (left != 0 || right != 0) ? 1 : 0;
  if (operation == "&&") return (left != 0 && right != 0) ? 1 : 0;
  if (operation == "==") return left == right ? 1 : 0;
  if (operation == "!=") return left != right ? 1 : 0;
  if (operation == "<") return left < right ? 1 : 0;
  if (operation == "<=") return left <= right ? 1 : 0;
  if (operation == ">") return left > right ? 1 : 0;
  if (operation == ">=") return left >= right ? 1 : 0;
  return CheckedShift(left, right, operation == "<<");
}

// Verilog's binary operators that bind more loosely than + and -, loosest first.
constexpr std::array<std::array<std::string_view, 4>, 5> kVerilogLooseOperators = {{
    {"||"},
    {"&&"},
    {"==", "!="},
    {"<", "<=", ">", ">="},
    {"<<", ">>"},
}};

// Recursive descent over one token list; every recursion step is counted against kMaxDepth.
class ExpressionParser {
 public:
  ExpressionParser(const PepTokens& tokens, PepLanguage language,
                   const PepExpressionEvaluator::Lookup& lookup)
      : tokens_(tokens), language_(language), lookup_(lookup) {}

  Value ParseAll() {
    Value value = Conditional();
    if (position_ != tokens_.size()) return std::nullopt;
    return value;
  }

 private:
  const PepToken& Current() const {
    static const PepToken kEnd;
    return position_ < tokens_.size() ? tokens_[position_] : kEnd;
  }

  bool TakeSymbol(std::string_view symbol) {
    if (!Current().IsSymbol(symbol)) return false;
    ++position_;
    return true;
  }

  bool TakeVhdlWord(std::string_view word) {
    if (language_ != PepLanguage::kVhdl || !Current().IsWord(word)) return false;
    ++position_;
    return true;
  }

  // Both branches of a Verilog ?: must have values, the one not taken too.
  Value Conditional() {
    Value condition = Loose(0);
    if (language_ != PepLanguage::kVerilog || !condition || !TakeSymbol("?")) return condition;
    DepthGuard guard(depth_);
    if (depth_ > PepExpressionEvaluator::kMaxDepth) return std::nullopt;
    Value whenTrue = Conditional();
    if (!whenTrue || !TakeSymbol(":")) return std::nullopt;
    Value whenFalse = Conditional();
    if (!whenFalse) return std::nullopt;
    return *condition != 0 ? whenTrue : whenFalse;
  }

  Value Loose(std::size_t level) {
    if (language_ != PepLanguage::kVerilog || level == kVerilogLooseOperators.size()) return Sum();
    Value value = Loose(level + 1);
    for (;;) {
      if (!value) return std::nullopt;
      const std::string_view operation = TakeAnySymbol(kVerilogLooseOperators[level]);
      if (operation.empty()) return value;
      Value right = Loose(level + 1);
      if (!right) return std::nullopt;
      value = ApplyVerilogOperator(operation, *value, *right);
    }
  }

  std::string_view TakeAnySymbol(const std::array<std::string_view, 4>& symbols) {
    for (std::string_view symbol : symbols) {
      if (!symbol.empty() && TakeSymbol(symbol)) return symbol;
    }
    return {};
  }

  Value Sum() {
    Value value = Product();
    for (;;) {
      if (!value) return std::nullopt;
      bool adding = TakeSymbol("+");
      if (!adding && !TakeSymbol("-")) return value;
      Value right = Product();
      if (!right) return std::nullopt;
      std::int64_t result = 0;
      bool overflow = adding ? __builtin_add_overflow(*value, *right, &result)
                             : __builtin_sub_overflow(*value, *right, &result);
      if (overflow) return std::nullopt;
      value = result;
    }
  }

  Value Product() {
    Value value = Unary();
    for (;;) {
      if (!value) return std::nullopt;
      char operation = TakeProductOperator();
      if (operation == 0) return value;
      Value right = Unary();
      if (!right) return std::nullopt;
      if (operation == '*') {
        std::int64_t result = 0;
        if (__builtin_mul_overflow(*value, *right, &result)) return std::nullopt;
        value = result;
      } else {
        value = CheckedDivision(*value, *right, operation);
      }
    }
  }

  // '*', '/', 'm' (mod) or 'r' (rem, %), 0 when none follows.
  char TakeProductOperator() {
    if (TakeSymbol("*")) return '*';
    if (TakeSymbol("/")) return '/';
    if (TakeVhdlWord("mod")) return 'm';
    if (TakeVhdlWord("rem")) return 'r';
    if (language_ == PepLanguage::kVerilog && TakeSymbol("%")) return 'r';
    return 0;
  }

  Value Unary() {
    DepthGuard guard(depth_);
    if (depth_ > PepExpressionEvaluator::kMaxDepth) return std::nullopt;
    if (TakeSymbol("+")) return Unary();
    if (TakeSymbol("-")) {
      Value operand = Unary();
      if (!operand || *operand == std::numeric_limits<std::int64_t>::min()) return std::nullopt;
      return -*operand;
    }
    if (TakeVhdlWord("abs")) {
      Value operand = Unary();
      if (!operand || *operand == std::numeric_limits<std::int64_t>::min()) return std::nullopt;
      return *operand < 0 ? -*operand : *operand;
    }
    return Power();
  }

  Value Power() {
    Value base = Primary();
    if (!base || !TakeSymbol("**")) return base;
    Value exponent = Unary();
    if (!exponent) return std::nullopt;
    return CheckedPower(*base, *exponent);
  }

  Value Primary() {
    const PepToken& token = Current();
    if (token.kind == PepToken::Kind::kNumber) {
      ++position_;
      return token.value;
    }
    if (token.IsName()) {
      ++position_;
      if (language_ == PepLanguage::kVerilog && token.IsWord("$clog2") && Current().IsSymbol("(")) {
        Value argument = Parenthesized();
        return argument ? CeilingLog2(*argument) : std::nullopt;
      }
      // Any other call, and an attribute, is not evaluated.
      if (Current().IsSymbol("(") || Current().IsSymbol("'")) return std::nullopt;
      return lookup_(token.key);
    }
    if (Current().IsSymbol("(")) return Parenthesized();
    return std::nullopt;
  }

  // At '(': the value of the expression up to the matching ')'.
  Value Parenthesized() {
    TakeSymbol("(");
    Value value = Conditional();
    if (!TakeSymbol(")")) return std::nullopt;
    return value;
  }

  struct DepthGuard {
    explicit DepthGuard(int& depth) : depth_(depth) { ++depth_; }
    ~DepthGuard() { --depth_; }
    int& depth_;
  };

  const PepTokens& tokens_;
  PepLanguage language_;
  const PepExpressionEvaluator::Lookup& lookup_;
  std::size_t position_ = 0;
  int depth_ = 0;
};

}  // namespace

std::optional<std::int32_t> PepExpressionEvaluator::Evaluate(const PepTokens& tokens) const {
  Value value = ExpressionParser(tokens, language_, lookup_).ParseAll();
  if (!value || *value < std::numeric_limits<std::int32_t>::min() ||
      *value > std::numeric_limits<std::int32_t>::max()) {
    return std::nullopt;
  }
  return static_cast<std::int32_t>(*value);
}
