#include "Library.h"

#include "Port/InitObjects.h"

namespace Vad {

Library::Library() : CHdlElement({}, nullptr) {}

Library::Library(std::string_view name, DbObject* parent) : CHdlElement(name, parent), libraryName_(name) {
  SetType(DbType::kLibrary);
}

CitI::IInterface* Library::QueryInterface(const Port::XUID& id) {
  if (id == Prjrep::IPersist::Iid()) return &persist_;
  return CHdlElement::QueryInterface(id);
}

CitI::Result Library::Load(Prjrep::IArchive* archive) {
  CitI::Result result = CHdlElement::Load(archive);
  return result == CitI::kOk ? PersistStrings(archive, false, {&libraryName_}) : result;
}

CitI::Result Library::Save(Prjrep::IArchive* archive) {
  CitI::Result result = CHdlElement::Save(archive);
  return result == CitI::kOk ? PersistStrings(archive, true, {&libraryName_}) : result;
}

void Library::ComposeStoreKey(Port::StringBase& key) {
  ComposeStoreKeyFor(libraryName_.view(), key);
  SetKey(key.view());
}

void Library::ComposeStoreKeyFor(std::string_view name, Port::StringBase& key) {
  JoinKeyFields(key, {"", "", TypeNameOf(DbType::kLibrary), name, ""});
}

}  // namespace Vad
