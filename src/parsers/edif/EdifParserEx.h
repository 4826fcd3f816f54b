// Reads EDIF netlists: a flat netlist through the keyword scanner of EdifParser (its top cells
// only), a partitioned one (or any, when the environment asks) through the EDIF grammar, which
// records every non-primitive cell as a module with its instances and their partitions.
#pragma once

#include "EdifParseContext.h"
#include "EdifParser.h"

namespace Vad {

class EdifParserEx : public EdifParser {
 public:
  static constexpr const char* kAlwaysHierarchical = "CORVANE_ALWAYS_EDIF_HIER";
  static constexpr const char* kNeverHierarchical = "CORVANE_NEVER_EDIF_HIER";
  static constexpr const char* kFileNotFound = "ERROR: Quillon.dll: EdifParserEx: %s file not found\n";
  static constexpr const char* kNoDesign = "No design in edif file: %s";

  int Parse(CParserConfigHolder& holder) override;

  static const Port::XUID& ModuleTypeId();
  static const Port::XUID& InstanceTypeId();

 private:
  int ParseHierarchy(CParserConfigHolder& holder, const Port::StringBase& path);
  void RecordDesign(CParserConfigHolder& holder, const Port::StringBase& path);
  void RecordModule(CParserConfigHolder& holder, const EdifNode& node, const EdifNode& design);
  void RecordInstances(CParserConfigHolder& holder, const EdifNode& module);

  EdifTree tree_;
  std::map<std::string, std::string> renames_;
};

}  // namespace Vad
