// The host's file-name helper component (Prjrep::IFileNameHelper).
#pragma once

#include "IFileNameHelper.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/TRefCountHelper.h"

namespace Host {

// Keeps the path as given and the full path it resolves to. A relative path whose directories
// are all empty or relative stays relative: nothing else is consulted to anchor it.
class FileNameHelper final : public Prjrep::IFileNameHelper {
 public:
  // A new helper with no path.
  static Prjrep::AutoPtr<Prjrep::IFileNameHelper> Create();

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;

  CitI::Result SetFilePath(const Port::StringBase& path, const Port::StringBase& baseDir,
                           const Port::StringBase& cwd) override;
  CitI::Result GetFilePath(Port::StringBase* out) override;
  CitI::Result GetDirectory(Port::StringBase* out) override;
  CitI::Result GetFileName(Port::StringBase* out) override;
  CitI::Result IsAbsolute(bool* out) override;
  CitI::Result Exists(bool* out) override;
  CitI::Result GetFullPath(Port::StringBase* out) override;
  CitI::Result GetModificationTime(std::int64_t* seconds) override;
  CitI::Result GetRelativePath(const Port::StringBase& baseDir, Port::StringBase* out) override;
  CitI::Result GetBaseName(Port::StringBase* out) override;
  CitI::Result GetExtension(Port::StringBase* out) override;
  CitI::Result SetExtension(const Port::StringBase& extension) override;
  CitI::Result HasExtension(const Port::StringBase& extension, bool* out) override;
  CitI::Result IsEmpty(bool* out) override;
  CitI::Result Clear() override;
  CitI::Result IsSameFile(Prjrep::IFileNameHelper* other, bool* out) override;

 private:
  FileNameHelper() = default;

  Prjrep::TRefCountHelper<> refCount_{this};
  Port::StringBase givenPath_;
  Port::StringBase fullPath_;
};

}  // namespace Host
