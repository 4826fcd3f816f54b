// Reads EDIF netlists through the netlist converter and the netlist database.
#pragma once

#include <map>
#include <string>

#include "CitI.h"
#include "Parser.h"

class Xdm_Block;

namespace Vad {

// Host type identifiers of what a netlist records.
namespace NetlistTypeIds {
QUILLON_XUID_FROM_TEXT(TopModule, "{8E6A8A42-F002-42fd-B41D-ACBD4C2B5496}")
QUILLON_XUID_FROM_TEXT(LowerModule, "{45521D25-692C-4132-B1A3-3B13F6144A62}")
QUILLON_XUID_FROM_TEXT(Instance, "{B237B353-2643-4349-909D-962EC491A5A1}")
}  // namespace NetlistTypeIds

class EdifParserPlx : public Parser {
 public:
  // Converts the netlist in its own directory to a netlist database ("<base name>.tbx") and
  // records one module per cell type with the instances of its non-primitive blocks. Always 0.
  int Parse(CParserConfigHolder& holder) override;

 private:
  void ReadDatabase(const char* path, CParserConfigHolder& holder);
  // Records the cell types below `top`, each once, in pre-order, without recursing.
  void WalkBlocks(const Xdm_Block& top, CParserConfigHolder& holder);
  // Records the block's type and its instances; false when the type was visited already.
  bool RecordBlock(const Xdm_Block& block, bool isTop, CParserConfigHolder& holder);

  // Cell type name -> how often it was met in this walk.
  std::map<std::string, int> visitedTypes_;
};

}  // namespace Vad
