// The base of every parser: one parser object reads one file into its parse-result holder.
#pragma once

#include <array>
#include <cstdint>

#include "CitI.h"
#include "Port/StringBase.h"

namespace Vad {

class CParserConfigHolder;
class IHdlDesignUnit;
class IHdlPortIterator;

class Parser {
 public:
  static constexpr int kTypeIdCount = 7;
  // Result of ExtractPorts for parsers that do not extract ports.
  static constexpr CitI::Result kNoPortExtraction = 8;

  Parser() = default;
  virtual ~Parser() = default;
  Parser(const Parser&) = delete;
  Parser& operator=(const Parser&) = delete;

  // Reads the holder's file and records what it holds into the holder. The status is not
  // inspected by any caller; results travel through the holder.
  virtual int Parse(CParserConfigHolder& holder) = 0;
  // Fills the port set of one design unit of the file. Leaves `ports` untouched here.
  virtual CitI::Result ExtractPorts(CParserConfigHolder& holder, IHdlDesignUnit* unit,
                                    IHdlPortIterator** ports);

  // Copies `id` into slot `index` and marks the slot as set; an index outside 0 to 6 is ignored.
  void SetTypeId(int index, const Port::XUID& id);
  // The slot's identifier; empty for a slot never set or an index outside 0 to 6.
  const Port::XUID& GetTypeId(int index) const;
  bool IsTypeIdSet(int index) const;

 private:
  static bool IsValidIndex(int index) { return index >= 0 && index < kTypeIdCount; }

  std::array<Port::XUID, kTypeIdCount> typeIds_{};
  std::array<bool, kTypeIdCount> typeIdSet_{};
};

}  // namespace Vad
