// Reads the fields of one design-unit record of the module: the persisted fields through the
// record's IPersist facet (saved into a RecordingArchive), the design-unit key through IName.
#pragma once

#include <optional>
#include <string>
#include <unordered_map>

#include "CitI.h"
#include "DesignModel.h"
#include "IPersist.h"

namespace quillon {

class UnitRecordReader {
 public:
  // False when the record answers no IPersist or saves itself in another layout; `info` then
  // holds what could be read. The records read through one reader must outlive it.
  bool Read(CitI::IInterface* unit, UnitInfo& info);

  // "Entity" for 2 and the other names of the module's single-bit type codes; "Unknown" for any
  // other value.
  static std::string TypeName(std::uint32_t typeCode);

 private:
  const std::optional<std::string>& ParentKeyOf(Prjrep::IPersist* parent);

  // The records of one file share a few parents; each is saved once.
  std::unordered_map<Prjrep::IPersist*, std::optional<std::string>> parentKeys_;
};

}  // namespace quillon
