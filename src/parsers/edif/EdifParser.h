// Reads the top cells and the device part of an EDIF netlist with a keyword scanner that looks
// only at the forms it needs.
#pragma once

#include <map>
#include <string>
#include <vector>

#include "CParserConfigHolder.h"
#include "Parser.h"
#include "Port/StringBase.h"

namespace Vad {

class EdifParser : public Parser {
 public:
  static constexpr const char* kMessageCategory = "ProjectMgmt";
  static constexpr const char* kMissingDesignCell =
      "ERROR: cell/library \"%s\", referenced in design...cellref clause, not found\n";
  static constexpr const char* kTruncatedToken = "EDIF parser truncated token to %s.\n";

  // What the keyword scanner found in a netlist.
  struct Summary {
    std::vector<Port::StringBase> designCells;
    Port::StringBase part;
    bool hasPartition = false;
  };

  // Records every design cell as a top module and stores the part in the holder; a hierarchy
  // file of the same base name in the current directory is read instead when there is one.
  int Parse(CParserConfigHolder& holder) override;

  static const Port::XUID& TopModuleTypeId();
  // Nothing is read when the file cannot be opened. With `stopAtPartition` the scan ends at the
  // first partition property.
  Summary ReadEdif(const Port::StringBase& path, bool stopAtPartition);

 protected:
  static void ReportError(const char* format, const char* text);
  static void RecordTopModules(CParserConfigHolder& holder, const Summary& summary);
  void ResetTables();

 private:
  class KeywordScanner;

  bool ReadSiblingHierarchyFile(CParserConfigHolder& holder);
  void ReadLibrary(KeywordScanner& scanner);
  void ReadCell(KeywordScanner& scanner);
  void ReadDesign(KeywordScanner& scanner, Summary& summary);
  static void ReadPart(KeywordScanner& scanner, Summary& summary);

  std::string library_;
  // "<EDIF name>|<library>" to the cell's display name.
  std::map<std::string, std::string> cells_;
};

}  // namespace Vad
