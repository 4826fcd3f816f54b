// What a design-unit record and the elaborator ask of a unit's source file. The file belongs to
// the project, a layer above the records, so they reach it through this face of the file link.
#pragma once

#include "HdlSets.h"
#include "IFileType.h"
#include "Port/StringBase.h"
#include "Prjrep/AutoPtr.h"

namespace Vad {

class IHdlDesignUnit;
class IHdlPortIterator;

class SourceFileLink {
 public:
  // The file type with one reference for the caller, or null.
  virtual Prjrep::AutoPtr<IFileType> GetFileType() const = 0;
  // The units of the file's last parse (no reference added), or null.
  virtual IHdlDesignUnitSet* GetUnitSet() const = 0;
  // Directory followed by file name; false when the file has no path.
  virtual bool GetFullFileName(Port::StringBase& out) const = 0;
  // Has the parser of the file's plug-in name extract the ports of `unit` into `out`; parsers
  // that extract no ports leave it untouched.
  virtual void ExtractPorts(IHdlDesignUnit* unit, IHdlPortIterator** out) = 0;

 protected:
  SourceFileLink() = default;
  SourceFileLink(const SourceFileLink&) = default;
  SourceFileLink& operator=(const SourceFileLink&) = default;
  virtual ~SourceFileLink() = default;
};

}  // namespace Vad
