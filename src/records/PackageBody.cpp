#include "PackageBody.h"

#include "Port/InitObjects.h"

namespace Vad {

PackageBody::PackageBody() : CVhdlDU({}, nullptr) {}

PackageBody::PackageBody(std::string_view name, DbObject* parent)
    : CVhdlDU(name, parent), packageName_(name) {
  SetType(DbType::kPackageBody);
}

CitI::IInterface* PackageBody::QueryInterface(const Port::XUID& id) {
  if (id == Prjrep::IPersist::Iid()) return &persist_;
  return CVhdlDU::QueryInterface(id);
}

void PackageBody::GetDesignUnitKey(Port::StringBase& out) const {
  Port::StringBase typeName;
  DbObject::GetDesignUnitKey(typeName);
  out.Format("%s|%s", typeName.c_str(), packageName_.c_str());
}

CitI::Result PackageBody::Load(Prjrep::IArchive* archive) {
  CitI::Result result = CVhdlDU::Load(archive);
  return result == CitI::kOk ? PersistStrings(archive, false, {&packageName_}) : result;
}

CitI::Result PackageBody::Save(Prjrep::IArchive* archive) {
  CitI::Result result = CVhdlDU::Save(archive);
  return result == CitI::kOk ? PersistStrings(archive, true, {&packageName_}) : result;
}

void PackageBody::ComposeStoreKey(Port::StringBase& key) {
  Port::StringBase prefix;
  AppendKeyPrefix(prefix);
  JoinKeyFields(key, {prefix.view(), packageName_.view(), ""});
  SetKey(key.view());
}

}  // namespace Vad
