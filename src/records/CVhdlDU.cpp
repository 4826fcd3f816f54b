#include "CVhdlDU.h"

#include "Port/InitObjects.h"

namespace Vad {

CVhdlDU::CVhdlDU(std::string_view name, DbObject* parent) : CHdlElement(name, parent) {}

CitI::IInterface* CVhdlDU::QueryInterface(const Port::XUID& id) {
  if (id == IHdlUseClauses::Iid()) return &useClausesFace_;
  return CHdlElement::QueryInterface(id);
}

CitI::Result CVhdlDU::CVhdlDU_IHdlUseClauses::GetUseCount(std::uint32_t* count) {
  if (!count) return CitI::kInvalidArg;
  *count = static_cast<std::uint32_t>(owner()->uses_.size());
  return CitI::kOk;
}

CitI::Result CVhdlDU::CVhdlDU_IHdlUseClauses::GetUseStoreKey(std::uint32_t index, Port::StringBase* key) {
  if (!key || index >= owner()->uses_.size()) return CitI::kInvalidArg;
  *key = owner()->uses_[index]->GetKey();
  return CitI::kOk;
}

CitI::Result CVhdlDU::Load(Prjrep::IArchive* archive) {
  CitI::Result result = CHdlElement::Load(archive);
  if (result != CitI::kOk) return result;
  std::int32_t count = 0;
  result = archive->ReadInt(&count);
  for (std::int32_t i = 0; result == CitI::kOk && i < count; ++i) {
    CitI::IInterface* ignoredUse = nullptr;
    result = archive->ReadObjectRef(&ignoredUse);
  }
  return result;
}

CitI::Result CVhdlDU::Save(Prjrep::IArchive* archive) {
  CitI::Result result = CHdlElement::Save(archive);
  return result == CitI::kOk ? archive->WriteInt(0) : result;
}

}  // namespace Vad
