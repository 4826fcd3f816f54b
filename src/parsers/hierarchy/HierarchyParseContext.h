// What the hierarchy scanner and grammar share during one parse of one file: the holder they
// record into, the input and the texts of the names read.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <utility>

#include "Port/StringBase.h"

namespace Port {
class Stream;
}

namespace Vad {

class CParserConfigHolder;

// The semantic value of every grammar symbol: a name (an index into the parse's name ring) or
// the value of a line number.
struct HierarchyValue {
  std::uint32_t name;
  std::uint32_t number;
};

// The names that grammar symbols carry. No rule holds more than two names on the stack and the
// scanner reads one more ahead, so a ring of eight never reuses a slot that is still in use, and
// the memory of a parse stays bounded however long the file is.
class HierarchyNameRing {
 public:
  static constexpr std::size_t kMaxLength = 1999;

  // Stores the name, cut to kMaxLength characters.
  std::uint32_t Add(std::string_view name) {
    next_ = (next_ + 1) % kSlots;
    names_[next_].assign(name.substr(0, kMaxLength));
    return next_;
  }
  Port::StringBase String(std::uint32_t slot) const { return Port::StringBase(names_[slot % kSlots]); }

 private:
  static constexpr std::uint32_t kSlots = 8;
  std::array<std::string, kSlots> names_;
  std::uint32_t next_ = 0;
};

struct HierarchyParseContext {
  HierarchyParseContext(CParserConfigHolder& recorder, Port::Stream& source, std::string sourcePath)
      : holder(recorder), input(source), path(std::move(sourcePath)) {}

  // Issues an error of the file at the line of the token read last: "<path>:<line>: <text>".
  void Error(const char* format, ...) __attribute__((format(printf, 2, 3)));

  CParserConfigHolder& holder;
  Port::Stream& input;
  std::string path;
  HierarchyNameRing names;
  std::uint32_t line = 1;       // of the next character the scanner reads
  std::uint32_t tokenLine = 1;  // of the token read last
  std::uint64_t labels = 0;     // instance labels that ranges made so far
};

// Runs the scanner and grammar over the context's input. 0 when the input was read to its end,
// 1 when the parse was abandoned (also when memory ran out), 2 when the parse stack overflowed.
// What was recorded before stays recorded.
int RunHierarchyGrammar(HierarchyParseContext& context);

}  // namespace Vad
