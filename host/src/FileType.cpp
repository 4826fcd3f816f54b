#include "Host/FileType.h"

#include <algorithm>

#include "ComponentSupport.h"
#include "Port/FileName.h"

namespace Host {

Prjrep::AutoPtr<Vad::IFileType> FileType::Create(std::string_view name,
                                                 std::initializer_list<std::string_view> extensions) {
  auto* fileType = new FileType(name);
  Prjrep::AutoRelease<Vad::IFileType> created(fileType);
  for (std::string_view extension : extensions) fileType->AddExtension(Port::StringBase(extension));
  return created;
}

CitI::IInterface* FileType::QueryInterface(const Port::XUID& id) {
  if (id == Prjrep::IRefCount::Iid()) return &refCount_;
  if (id == Vad::IFileType::Iid() || id == CitI::IInterface::Iid()) return this;
  return nullptr;
}

CitI::Result FileType::GetName(Port::StringBase* out) { return CopyOut(name_, out); }

CitI::Result FileType::SetName(const Port::StringBase& name) {
  if (name.IsEmpty()) return CitI::kInvalidArg;
  name_ = name;
  return CitI::kOk;
}

CitI::Result FileType::GetExtensionCount(std::uint32_t* count) {
  return CopyOut(static_cast<std::uint32_t>(extensions_.size()), count);
}

CitI::Result FileType::GetExtension(std::uint32_t index, Port::StringBase* out) {
  if (!out) return CitI::kInvalidArg;
  out->Empty();
  if (index >= extensions_.size()) return CitI::kInvalidArg;
  *out = extensions_[index];
  return CitI::kOk;
}

CitI::Result FileType::AddExtension(const Port::StringBase& extension) {
  std::string_view text = ExtensionText(extension.view());
  if (text.empty() || text.find('/') != std::string_view::npos) return CitI::kInvalidArg;
  if (!HasExtension(text)) extensions_.emplace_back(text);
  return CitI::kOk;
}

CitI::Result FileType::MatchesPath(const Port::StringBase& path, bool* out) {
  Port::StringBase extension = Port::FileName::GetExtension(path.view());
  return CopyOut(!extension.IsEmpty() && HasExtension(extension.view()), out);
}

bool FileType::HasExtension(std::string_view extension) const {
  return std::any_of(extensions_.begin(), extensions_.end(), [&](const Port::StringBase& own) {
    return own.Equals(extension, Port::kCompareNoCase);
  });
}

}  // namespace Host
