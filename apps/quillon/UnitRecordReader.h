// Reads the fields of one design-unit record of the module: the persisted fields through the
// record's IPersist facet (saved into a RecordingArchive), the design-unit key through IName.
#pragma once

#include <string>

#include "CitI.h"
#include "DesignModel.h"

namespace quillon {

class UnitRecordReader {
 public:
  // False when the record answers no IPersist or saves itself in another layout; `info` then
  // holds what could be read.
  static bool Read(CitI::IInterface* unit, UnitInfo& info);

  // "Entity" for 2 and the other names of the module's single-bit type codes; "Unknown" for any
  // other value.
  static std::string TypeName(std::uint32_t typeCode);
};

}  // namespace quillon
