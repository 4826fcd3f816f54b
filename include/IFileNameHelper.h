// The host's file-name helper: one path, resolved once, taken apart on request.
#pragma once

#include <cstdint>

#include "CitI.h"
#include "Identifiers.h"
#include "Port/StringBase.h"

namespace Prjrep {

// Every operation returns kOk on success and kInvalidArg for a null out-parameter. The path
// "as given" is the first argument of SetFilePath; the full path is the absolute path it
// resolves to. Before a path is set, or after Clear, the text answers are empty.
class IFileNameHelper : public CitI::IInterface {
 public:
  QUILLON_INTERFACE_ID_OF(Vad::InterfaceIds::IFileNameHelper)

  // Slot 2. An absolute `path` is taken as is; a relative one is resolved against `baseDir` when
  // that is non-empty (a relative `baseDir` against `cwd` first), else against `cwd`, and its
  // "." and ".." are resolved. kInvalidArg for an empty path, and the helper is unchanged.
  virtual CitI::Result SetFilePath(const Port::StringBase& path, const Port::StringBase& baseDir,
                                   const Port::StringBase& cwd) = 0;
  // Slot 3. The path as given.
  virtual CitI::Result GetFilePath(Port::StringBase* out) = 0;
  // Slot 4. The full path's directory with its trailing '/' ("/x/top.v" -> "/x/").
  virtual CitI::Result GetDirectory(Port::StringBase* out) = 0;
  // Slot 5. The full path's file name with its extension ("/x/top.v" -> "top.v").
  virtual CitI::Result GetFileName(Port::StringBase* out) = 0;
  // Slot 6. Whether the path as given was absolute (false when none is set).
  virtual CitI::Result IsAbsolute(bool* out) = 0;
  // Slot 7. Whether something exists at the full path (false when none is set).
  virtual CitI::Result Exists(bool* out) = 0;
  // Slot 8.
  virtual CitI::Result GetFullPath(Port::StringBase* out) = 0;
  // Slot 9. Modification time in seconds since the epoch; kFail (0 written) when no path is set
  // or the file cannot be examined.
  virtual CitI::Result GetModificationTime(std::int64_t* seconds) = 0;
  // Slot 10. The full path relative to the absolute directory `baseDir` ("../b/top.v"; "." for
  // the directory itself). kInvalidArg for a relative or empty `baseDir`; kFail when no path is
  // set or the full path is not absolute.
  virtual CitI::Result GetRelativePath(const Port::StringBase& baseDir, Port::StringBase* out) = 0;
  // Slot 11. The file name without directory and extension ("/x/top.v" -> "top").
  virtual CitI::Result GetBaseName(Port::StringBase* out) = 0;
  // Slot 12. The extension without its dot; empty when the file name has none ("/x/Makefile",
  // "/x/a.b/c", "/x/.cfg").
  virtual CitI::Result GetExtension(Port::StringBase* out) = 0;
  // Slot 13. Replaces the extension of the path as given and of the full path (an empty
  // `extension` removes it). kFail when no path is set; kInvalidArg for an extension holding '/'.
  virtual CitI::Result SetExtension(const Port::StringBase& extension) = 0;
  // Slot 14. Whether the extension equals `extension`, ASCII case folded.
  virtual CitI::Result HasExtension(const Port::StringBase& extension, bool* out) = 0;
  // Slot 15. Whether no path is set.
  virtual CitI::Result IsEmpty(bool* out) = 0;
  // Slot 16. Forgets the path.
  virtual CitI::Result Clear() = 0;
  // Slot 17. Whether both helpers hold the same non-empty full path, byte for byte. kInvalidArg
  // for a null `other`.
  virtual CitI::Result IsSameFile(IFileNameHelper* other, bool* out) = 0;
};

}  // namespace Prjrep
