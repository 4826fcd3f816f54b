// Reads the fields of one design-unit record of the module: the persisted fields through the
// record's IPersist facet (saved into a RecordingArchive), the design-unit key through IName.
#pragma once

#include <optional>
#include <string>
#include <unordered_map>

#include "CitI.h"
#include "DesignModel.h"
#include "IPersist.h"
#include "RecordingArchive.h"

namespace quillon {

class UnitRecordReader {
 public:
  // Without links, the parent's store key and the use list stay unset: only the JSON listing of
  // the units shows them, and they cost a save of the parent and a copy of every use key.
  explicit UnitRecordReader(bool withLinks = true) : withLinks_(withLinks) {}

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
  // Saved into again for every record: growing a fresh list of values each time was a large part
  // of reading a record.
  RecordingArchive archive_;
  bool withLinks_;
};

}  // namespace quillon
