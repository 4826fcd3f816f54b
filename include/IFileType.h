// The host's file-type component: a named kind of source file and the extensions it claims.
#pragma once

#include <cstdint>

#include "CitI.h"
#include "Identifiers.h"
#include "Port/StringBase.h"

namespace Vad {

// Extensions are kept without their dot and compared with ASCII case folded. Null
// out-parameters give kInvalidArg.
class IFileType : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(Vad::InterfaceIds::IFileType)
  virtual CitI::Result GetName(Port::StringBase* out) = 0;
  virtual CitI::Result SetName(const Port::StringBase& name) = 0;
  virtual CitI::Result GetExtensionCount(std::uint32_t* count) = 0;
  // kInvalidArg (out emptied) for an index past the end.
  virtual CitI::Result GetExtension(std::uint32_t index, Port::StringBase* out) = 0;
  // Adds an extension once; a leading dot is dropped. kInvalidArg for an empty extension or one
  // holding '/'.
  virtual CitI::Result AddExtension(const Port::StringBase& extension) = 0;
  // Whether the extension of `path` is one of this type's.
  virtual CitI::Result MatchesPath(const Port::StringBase& path, bool* out) = 0;
};

}  // namespace Vad
