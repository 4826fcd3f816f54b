#include "Arch.h"

#include "Port/InitObjects.h"

namespace Vad {

Arch::Arch() : CVhdlDU({}, nullptr) {}

Arch::Arch(std::string_view entityName, std::string_view architectureName, DbObject* parent)
    : CVhdlDU(architectureName, parent), architectureName_(architectureName), entityName_(entityName) {
  SetType(DbType::kArchitecture);
}

CitI::IInterface* Arch::QueryInterface(const Port::XUID& id) {
  if (id == Prjrep::IPersist::Iid()) return &persist_;
  return CVhdlDU::QueryInterface(id);
}

void Arch::GetDesignUnitKey(Port::StringBase& out) const {
  Port::StringBase typeName;
  DbObject::GetDesignUnitKey(typeName);
  out.Format("%s|%s|%s", typeName.c_str(), entityName_.c_str(), architectureName_.c_str());
}

CitI::Result Arch::Load(Prjrep::IArchive* archive) {
  CitI::Result result = CVhdlDU::Load(archive);
  if (result != CitI::kOk) return result;
  return PersistStrings(archive, false, {&reservedA_, &architectureName_, &reservedB_, &entityName_});
}

CitI::Result Arch::Save(Prjrep::IArchive* archive) {
  CitI::Result result = CVhdlDU::Save(archive);
  if (result != CitI::kOk) return result;
  return PersistStrings(archive, true, {&reservedA_, &architectureName_, &reservedB_, &entityName_});
}

void Arch::ComposeStoreKey(Port::StringBase& key) {
  Port::StringBase prefix;
  AppendKeyPrefix(prefix);
  JoinKeyFields(key, {prefix.view(), architectureName_.view(), entityName_.view(), reservedB_.view(), ""});
  SetKey(key.view());
}

}  // namespace Vad
