#include "generic.h"

#include "Port/InitObjects.h"

namespace Vad {

generic::generic() : CHdlElement({}, nullptr) {}

generic::generic(std::string_view name, DbObject* parent) : CHdlElement(name, parent), genericName_(name) {
  SetType(DbType::kGeneric);
}

CitI::IInterface* generic::QueryInterface(const Port::XUID& id) {
  if (id == Prjrep::IPersist::Iid()) return &persist_;
  return CHdlElement::QueryInterface(id);
}

void generic::GetDesignUnitKey(Port::StringBase& out) const {
  Port::StringBase typeName;
  DbObject::GetDesignUnitKey(typeName);
  out.Format("%s|%s", typeName.c_str(), genericName_.c_str());
}

// The object name goes out a second time before the generic name.
CitI::Result generic::Load(Prjrep::IArchive* archive) {
  CitI::Result result = CHdlElement::Load(archive);
  return result == CitI::kOk ? PersistStrings(archive, false, {&NameField(), &genericName_}) : result;
}

CitI::Result generic::Save(Prjrep::IArchive* archive) {
  CitI::Result result = CHdlElement::Save(archive);
  return result == CitI::kOk ? PersistStrings(archive, true, {&NameField(), &genericName_}) : result;
}

void generic::ComposeStoreKey(Port::StringBase& key) {
  Port::StringBase prefix;
  AppendKeyPrefix(prefix);
  JoinKeyFields(key, {prefix.view(), genericName_.view()});
  SetKey(key.view());
}

}  // namespace Vad
