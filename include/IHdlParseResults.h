// The design units of a source file's last parse, written to and read from a project archive, so
// that a host can keep them between sessions and skip parsing files that did not change.
#pragma once

#include "CitI.h"
#include "IPersist.h"
#include "Identifiers.h"

namespace Vad {

class IHdlParseResults : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::IHdlParseResults)
  // Writes every record of the last parse with its use list. 0 when the file needs a parse or a
  // record cannot be written; an archive failure is returned unchanged.
  virtual CitI::Result saveParseResults(Prjrep::IArchive* archive) = 0;
  // Reads what saveParseResults wrote and makes it the file's design units, as if the file had
  // just been parsed with the project's current configuration, library and file list. The host
  // answers for the archive matching the file's content. On any failure the file keeps its units
  // and its needs-parse flag, and the result is not 1.
  virtual CitI::Result loadParseResults(Prjrep::IArchive* archive) = 0;
};

}  // namespace Vad
