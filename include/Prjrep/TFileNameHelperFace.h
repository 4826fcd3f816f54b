// A face through which an object answers IFileNameHelper with a file-name helper it keeps.
#pragma once

#include <cstdint>

#include "IFileNameHelper.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/TFace.h"

namespace Prjrep {

// Every operation goes to the helper in `helper` (a member of the owner, read on each call);
// kFail while the owner keeps none. Queries go to the owner.
template <class Owner>
class TFileNameHelperFace final : public TFace<IFileNameHelper, Owner> {
 public:
  TFileNameHelperFace(Owner* owner, const AutoPtr<IFileNameHelper>* helper)
      : TFace<IFileNameHelper, Owner>(owner), helper_(helper) {}

  CitI::Result SetFilePath(const Port::StringBase& path, const Port::StringBase& baseDir,
                           const Port::StringBase& cwd) override {
    return Forward([&](IFileNameHelper& h) { return h.SetFilePath(path, baseDir, cwd); });
  }
  CitI::Result GetFilePath(Port::StringBase* out) override {
    return Forward([&](IFileNameHelper& h) { return h.GetFilePath(out); });
  }
  CitI::Result GetDirectory(Port::StringBase* out) override {
    return Forward([&](IFileNameHelper& h) { return h.GetDirectory(out); });
  }
  CitI::Result GetFileName(Port::StringBase* out) override {
    return Forward([&](IFileNameHelper& h) { return h.GetFileName(out); });
  }
  CitI::Result IsAbsolute(bool* out) override {
    return Forward([&](IFileNameHelper& h) { return h.IsAbsolute(out); });
  }
  CitI::Result Exists(bool* out) override {
    return Forward([&](IFileNameHelper& h) { return h.Exists(out); });
  }
  CitI::Result GetFullPath(Port::StringBase* out) override {
    return Forward([&](IFileNameHelper& h) { return h.GetFullPath(out); });
  }
  CitI::Result GetModificationTime(std::int64_t* seconds) override {
    return Forward([&](IFileNameHelper& h) { return h.GetModificationTime(seconds); });
  }
  CitI::Result GetRelativePath(const Port::StringBase& baseDir, Port::StringBase* out) override {
    return Forward([&](IFileNameHelper& h) { return h.GetRelativePath(baseDir, out); });
  }
  CitI::Result GetBaseName(Port::StringBase* out) override {
    return Forward([&](IFileNameHelper& h) { return h.GetBaseName(out); });
  }
  CitI::Result GetExtension(Port::StringBase* out) override {
    return Forward([&](IFileNameHelper& h) { return h.GetExtension(out); });
  }
  CitI::Result SetExtension(const Port::StringBase& extension) override {
    return Forward([&](IFileNameHelper& h) { return h.SetExtension(extension); });
  }
  CitI::Result HasExtension(const Port::StringBase& extension, bool* out) override {
    return Forward([&](IFileNameHelper& h) { return h.HasExtension(extension, out); });
  }
  CitI::Result IsEmpty(bool* out) override {
    return Forward([&](IFileNameHelper& h) { return h.IsEmpty(out); });
  }
  CitI::Result Clear() override {
    return Forward([&](IFileNameHelper& h) { return h.Clear(); });
  }
  CitI::Result IsSameFile(IFileNameHelper* other, bool* out) override {
    return Forward([&](IFileNameHelper& h) { return h.IsSameFile(other, out); });
  }

 private:
  template <class Call>
  CitI::Result Forward(Call call) {
    IFileNameHelper* helper = helper_->Get();
    return helper ? call(*helper) : CitI::kFail;
  }

  const AutoPtr<IFileNameHelper>* helper_;
};

}  // namespace Prjrep
