#include "PackageDecl.h"

#include "Port/InitObjects.h"

namespace Vad {

PackageDecl::PackageDecl() : CVhdlDU({}, nullptr) {}

PackageDecl::PackageDecl(std::string_view name, DbObject* parent)
    : CVhdlDU(name, parent), packageName_(name) {
  SetType(DbType::kPackageDecl);
}

CitI::IInterface* PackageDecl::QueryInterface(const Port::XUID& id) {
  if (id == Prjrep::IPersist::Iid()) return &persist_;
  return CVhdlDU::QueryInterface(id);
}

void PackageDecl::GetDesignUnitKey(Port::StringBase& out) const {
  Port::StringBase typeName;
  DbObject::GetDesignUnitKey(typeName);
  out.Format("%s|%s", typeName.c_str(), packageName_.c_str());
}

CitI::Result PackageDecl::Load(Prjrep::IArchive* archive) {
  CitI::Result result = CVhdlDU::Load(archive);
  return result == CitI::kOk ? PersistStrings(archive, false, {&packageName_}) : result;
}

CitI::Result PackageDecl::Save(Prjrep::IArchive* archive) {
  CitI::Result result = CVhdlDU::Save(archive);
  return result == CitI::kOk ? PersistStrings(archive, true, {&packageName_}) : result;
}

void PackageDecl::ComposeStoreKey(Port::StringBase& key) {
  Port::StringBase prefix;
  AppendKeyPrefix(prefix);
  JoinKeyFields(key, {prefix.view(), packageName_.view(), ""});
  SetKey(key.view());
}

}  // namespace Vad
