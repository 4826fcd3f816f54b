// Set and iterator interfaces over the module's element kinds.
#pragma once

#include "Identifiers.h"
#include "Prjrep/ISet.h"

namespace Vad {

class IHdlFile;
class IHdlDesignUnit;
class IPropertyInstance;

class IHdlFileIterator : public Prjrep::IIteratorOf<IHdlFile> {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::IHdlFileIterator)
};
class IHdlFileSet : public Prjrep::ISetOf<IHdlFile, IHdlFileIterator> {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::IHdlFileSet)
};

class IHdlDesignUnitIterator : public Prjrep::IIteratorOf<IHdlDesignUnit> {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::IHdlDesignUnitIterator)
};
class IHdlDesignUnitSet : public Prjrep::ISetOf<IHdlDesignUnit, IHdlDesignUnitIterator> {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::IHdlDesignUnitSet)
};

class IPropertyInstanceIterator : public Prjrep::IIteratorOf<IPropertyInstance> {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::IPropertyInstanceIterator)
};
class IPropertyInstanceSet : public Prjrep::ISetOf<IPropertyInstance, IPropertyInstanceIterator> {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::IPropertyInstanceSet)
};

}  // namespace Vad
