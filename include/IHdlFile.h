// The source file as the host sees it (CHdlFile). The file answers the IHdlFile identifier for
// the whole chain IHdlFileV1 -> IHdlFileV2 -> IHdlFile, and IHdlFileV3 separately.
#pragma once

#include <cstdint>

#include "CitI.h"
#include "HdlSets.h"
#include "Identifiers.h"
#include "Port/StringBase.h"

namespace Vad {

class IHdlProject;

// Null out-parameters give kInvalidArg unless stated otherwise.
class IHdlFileV1 : public CitI::IInterface {
 public:
  // Slot 2. Parses the file when it is out of date (no project file list is given).
  virtual CitI::Result parseIfNeeded() = 0;
  // Slot 3. Always 1.
  virtual CitI::Result setNeedsParse(bool needsParse) = 0;
  // Slot 4. The owning project with one reference, or null outside a project; 1.
  virtual CitI::Result getProject(IHdlProject** out) = 0;
  // Slot 5. Handed to the file-name helper with the current directory; 0 without a helper.
  virtual CitI::Result setFilePath(const Port::StringBase& path, const Port::StringBase& baseDir) = 0;
  // Slot 6. The directory (full path minus the file name) and the file name (base name, plus "."
  // and the extension when there is one); 0 without a file-name helper.
  virtual CitI::Result getFileName(Port::StringBase* directory, Port::StringBase* fileName) = 0;
  // Slot 7. A new iterator over the units of the last parse; `context` is not used. Does not
  // parse.
  virtual CitI::Result getDesignUnits(CitI::IInterface* context, IHdlDesignUnitIterator** out) = 0;
  // Slot 8. Not provided: clears `out`, kNotImpl.
  virtual CitI::Result Reserved8(CitI::IInterface* argument, CitI::IInterface** out) = 0;
  // Slot 9. Brings the file up to date, then copies the parse's result text (empty in this
  // system); a failed parse returns its result.
  virtual CitI::Result getResultText(Port::StringBase* out) = 0;
};

class IHdlFileV2 : public IHdlFileV1 {
 public:
  // Slots 10 and 11. Always 1.
  virtual CitI::Result setPluginName(const Port::StringBase& name) = 0;
  virtual CitI::Result getPluginName(Port::StringBase* out) = 0;
};

class IHdlFile : public IHdlFileV2 {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::IHdlFile)
  // Slots 12 to 15. Always 1 (a null out-parameter is left alone).
  virtual CitI::Result getOrderKey(std::uint64_t* out) = 0;
  // The same operation as getOrderKey, in a slot of its own.
  virtual CitI::Result getOrderKeyAlias(std::uint64_t* out) = 0;
  virtual CitI::Result setOrderKey(std::uint64_t key) = 0;
  virtual CitI::Result getNeedsParse(bool* out) = 0;
};

// Only files with this flag set take part in the project's survey of Verilog files.
class IHdlFileV3 : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(InterfaceIds::IHdlFileV3)
  // Slots 2 and 3. Always 1.
  virtual CitI::Result setV3Flag(bool flag) = 0;
  virtual CitI::Result getV3Flag(bool* out) = 0;
};

}  // namespace Vad
