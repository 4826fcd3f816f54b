// The archive layout of one file's parse results: the records of its unit set by reference in set
// order, the records without a parent as owned objects (their children with them), and the use
// list of every record.
#pragma once

#include <vector>

#include "CitI.h"
#include "HdlSets.h"
#include "IPersist.h"
#include "Prjrep/AutoPtr.h"

namespace Vad {

class ParseResultsArchive {
 public:
  using Records = std::vector<Prjrep::AutoPtr<CitI::IInterface>>;

  // kFail when a record is no design object of this module or lies outside the written trees.
  static CitI::Result Save(IHdlDesignUnitSet* units, Prjrep::IArchive* archive);
  // The records in set order, with their use lists restored. kFail when the archive refers to a
  // record it does not hold.
  static CitI::Result Load(Prjrep::IArchive* archive, Records& records);
};

}  // namespace Vad
