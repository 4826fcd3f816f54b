// Reads what the module derives from a built project: the design units of every file and the
// compile orders. Every operation hands back the module's result; the caller reports failures.
#pragma once

#include <functional>
#include <optional>
#include <vector>

#include "DesignModel.h"
#include "HdlSets.h"
#include "IHdlProject.h"
#include "Prjrep/AutoPtr.h"
#include "Progress.h"

namespace Vad {
class IHdlDesignUnit;
}

namespace quillon {

class ParseCache;

class ProjectReader {
 public:
  ProjectReader(Vad::IHdlProject* project, Progress& progress) : project_(project), progress_(progress) {}

  // Brings every file up to date, through `cache` when given, and keeps the project's design
  // units.
  CitI::Result Parse(ParseCache* cache = nullptr);
  // Entities, architectures, packages, package bodies, modules and generics of the last Parse.
  Vad::IHdlDesignUnitSet* designUnits() const { return designUnits_.Get(); }
  enum class UnitFields {
    kAll,
    kWithoutLinks,  // no parent keys and use lists (UnitRecordReader)
  };
  // Every file of the project's file set, with every record of its unit set. Does not parse.
  std::vector<FileInfo> Files(UnitFields fields = UnitFields::kAll) const;
  // The same files one at a time: `visit` gets each in a FileInfo that is then reused for the
  // next, so that listing a large project never holds all of its records at once.
  void VisitFiles(UnitFields fields, const std::function<void(FileInfo&)>& visit) const;

  // The compile order of the whole project, or for `unit` (byUnit: the unit alone, else the unit
  // and what it needs).
  CitI::Result Order(std::vector<OrderEntry>& order) const;
  CitI::Result OrderOf(Vad::IHdlDesignUnit* unit, bool byUnit, std::vector<OrderEntry>& order) const;

  // The ports of `unit` in port order. The module's result; `ports` stays unset when no port
  // iterator came back (the module's messages say why).
  CitI::Result PortsOf(Vad::IHdlDesignUnit* unit, std::optional<std::vector<PortInfo>>& ports) const;

  std::size_t FileCount() const;
  // Every record of the file's unit set.
  static std::vector<UnitInfo> UnitsOf(Vad::IHdlFile* file);

 private:
  void ParseFilesOneByOne(ParseCache* cache);
  static std::vector<OrderEntry> Describe(Vad::IHdlFileIterator* files);

  Vad::IHdlProject* project_;
  Progress& progress_;
  Prjrep::AutoPtr<Vad::IHdlDesignUnitSet> designUnits_;
};

}  // namespace quillon
