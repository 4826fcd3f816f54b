#include "Host/FileNameHelper.h"

#include <algorithm>
#include <string>
#include <vector>

#include "ComponentSupport.h"
#include "Port/File.h"
#include "Port/FileName.h"

namespace Host {
namespace {

using Port::FileName;
using Port::StringBase;

StringBase Canonical(std::string_view absolutePath) {
  StringBase path(absolutePath);
  FileName::MakeCanonical(&path);
  return path;
}

StringBase ResolvedPath(std::string_view path, std::string_view baseDir, std::string_view cwd) {
  if (FileName::IsAbsolute(path)) return StringBase(path);
  StringBase anchor = baseDir.empty() ? StringBase(cwd) : FileName::Join(cwd, baseDir);
  StringBase full = FileName::Join(anchor.view(), path);
  return FileName::IsAbsolute(full.view()) ? Canonical(full.view()) : full;
}

std::vector<StringBase> PathParts(std::string_view path) {
  std::vector<StringBase> parts;
  StringBase(path).Split(parts, "/");
  return parts;
}

// Both paths absolute and canonical.
StringBase RelativePath(std::string_view path, std::string_view baseDir) {
  std::vector<StringBase> to = PathParts(path);
  std::vector<StringBase> from = PathParts(baseDir);
  auto firstDifferent = std::mismatch(to.begin(), to.end(), from.begin(), from.end());
  std::size_t common = static_cast<std::size_t>(firstDifferent.first - to.begin());
  std::vector<StringBase> steps(from.size() - common, StringBase(".."));
  steps.insert(steps.end(), to.begin() + static_cast<std::ptrdiff_t>(common), to.end());
  if (steps.empty()) return StringBase(".");
  std::string joined;
  for (const StringBase& step : steps) {
    if (!joined.empty()) joined += '/';
    joined += step.str();
  }
  return StringBase(std::move(joined));
}

StringBase WithExtension(std::string_view path, std::string_view extension) {
  StringBase result = FileName::GetHead(path);
  result += FileName::GetBase(path).view();
  if (!extension.empty()) result.Append('.').Append(extension);
  return result;
}

}  // namespace

Prjrep::AutoPtr<Prjrep::IFileNameHelper> FileNameHelper::Create() {
  return Prjrep::AutoRelease<Prjrep::IFileNameHelper>(new FileNameHelper);
}

CitI::IInterface* FileNameHelper::QueryInterface(const Port::XUID& id) {
  if (id == Prjrep::IRefCount::Iid()) return &refCount_;
  if (id == Prjrep::IFileNameHelper::Iid() || id == CitI::IInterface::Iid()) return this;
  return nullptr;
}

CitI::Result FileNameHelper::SetFilePath(const StringBase& path, const StringBase& baseDir,
                                         const StringBase& cwd) {
  if (path.IsEmpty()) return CitI::kInvalidArg;
  givenPath_ = path;
  fullPath_ = ResolvedPath(path.view(), baseDir.view(), cwd.view());
  return CitI::kOk;
}

CitI::Result FileNameHelper::GetFilePath(StringBase* out) { return CopyOut(givenPath_, out); }

CitI::Result FileNameHelper::GetDirectory(StringBase* out) {
  return CopyOut(FileName::GetHead(fullPath_.view()), out);
}

CitI::Result FileNameHelper::GetFileName(StringBase* out) {
  return CopyOut(FileName::GetTail(fullPath_.view()), out);
}

CitI::Result FileNameHelper::IsAbsolute(bool* out) {
  return CopyOut(FileName::IsAbsolute(givenPath_.view()), out);
}

CitI::Result FileNameHelper::Exists(bool* out) {
  return CopyOut(!fullPath_.IsEmpty() && Port::File::exist(fullPath_.c_str()), out);
}

CitI::Result FileNameHelper::GetFullPath(StringBase* out) { return CopyOut(fullPath_, out); }

CitI::Result FileNameHelper::GetModificationTime(std::int64_t* seconds) {
  if (!seconds) return CitI::kInvalidArg;
  std::int64_t modified = 0;
  bool known = !fullPath_.IsEmpty() && Port::File::getdatetime(fullPath_.c_str(), &modified);
  *seconds = known ? modified : 0;
  return known ? CitI::kOk : CitI::kFail;
}

CitI::Result FileNameHelper::GetRelativePath(const StringBase& baseDir, StringBase* out) {
  if (!out) return CitI::kInvalidArg;
  out->Empty();
  if (!FileName::IsAbsolute(baseDir.view())) return CitI::kInvalidArg;
  if (!FileName::IsAbsolute(fullPath_.view())) return CitI::kFail;
  *out = RelativePath(Canonical(fullPath_.view()).view(), Canonical(baseDir.view()).view());
  return CitI::kOk;
}

CitI::Result FileNameHelper::GetBaseName(StringBase* out) {
  return CopyOut(FileName::GetBase(fullPath_.view()), out);
}

CitI::Result FileNameHelper::GetExtension(StringBase* out) {
  return CopyOut(FileName::GetExtension(fullPath_.view()), out);
}

CitI::Result FileNameHelper::SetExtension(const StringBase& extension) {
  std::string_view text = ExtensionText(extension.view());
  if (text.find('/') != std::string_view::npos) return CitI::kInvalidArg;
  if (givenPath_.IsEmpty()) return CitI::kFail;
  givenPath_ = WithExtension(givenPath_.view(), text);
  fullPath_ = WithExtension(fullPath_.view(), text);
  return CitI::kOk;
}

CitI::Result FileNameHelper::HasExtension(const StringBase& extension, bool* out) {
  StringBase own = FileName::GetExtension(fullPath_.view());
  return CopyOut(own.Equals(ExtensionText(extension.view()), Port::kCompareNoCase), out);
}

CitI::Result FileNameHelper::IsEmpty(bool* out) { return CopyOut(givenPath_.IsEmpty(), out); }

CitI::Result FileNameHelper::Clear() {
  givenPath_.Empty();
  fullPath_.Empty();
  return CitI::kOk;
}

CitI::Result FileNameHelper::IsSameFile(Prjrep::IFileNameHelper* other, bool* out) {
  if (!other || !out) return CitI::kInvalidArg;
  *out = false;
  StringBase otherPath;
  CitI::Result result = other->GetFullPath(&otherPath);
  if (result != CitI::kOk) return result;
  *out = !fullPath_.IsEmpty() && fullPath_ == otherPath;
  return CitI::kOk;
}

}  // namespace Host
