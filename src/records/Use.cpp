#include "Use.h"

#include <vector>

#include "Port/InitObjects.h"

namespace Vad {

Use::Use() : CHdlElement({}, nullptr) {}

Use::Use(std::string_view name, DbObject* parent) : CHdlElement(name, parent) {
  SetType(DbType::kUse);
  Parts parts = PartsOf(name);
  library_ = std::move(parts.library);
  package_ = std::move(parts.package);
  item_ = std::move(parts.item);
}

Use::Parts Use::PartsOf(std::string_view name) {
  std::vector<Port::StringBase> pieces;
  Port::StringBase(name).Split(pieces, ".", false, "\"", "\"");
  Parts parts;
  Port::StringBase* fields[] = {&parts.library, &parts.package, &parts.item};
  for (std::size_t i = 0; i < pieces.size() && i < std::size(fields); ++i) *fields[i] = std::move(pieces[i]);
  return parts;
}

CitI::IInterface* Use::QueryInterface(const Port::XUID& id) {
  if (id == Prjrep::IPersist::Iid()) return &persist_;
  return CHdlElement::QueryInterface(id);
}

CitI::Result Use::Load(Prjrep::IArchive* archive) {
  CitI::Result result = CHdlElement::Load(archive);
  return result == CitI::kOk ? PersistParts(archive, false) : result;
}

CitI::Result Use::Save(Prjrep::IArchive* archive) {
  CitI::Result result = CHdlElement::Save(archive);
  return result == CitI::kOk ? PersistParts(archive, true) : result;
}

CitI::Result Use::PersistParts(Prjrep::IArchive* archive, bool saving) {
  for (Port::StringBase* part : {&library_, &package_, &item_}) PersistStrings(archive, saving, {part});
  return CitI::kOk;
}

void Use::SetParts(std::string_view library, std::string_view package, std::string_view item) {
  library_ = library;
  package_ = package;
  item_ = item;
}

void Use::ComposeStoreKey(Port::StringBase& key) {
  JoinKeyFields(key, {"", "", GetTypeName(), library_.view(), package_.view(), item_.view(), ""});
  SetKey(key.view());
}

void Use::ComposeStoreKeyFor(std::string_view name, Port::StringBase& key) {
  Parts parts = PartsOf(name);
  JoinKeyFields(key, {"", "", TypeNameOf(DbType::kUse), parts.library.view(), parts.package.view(),
                      parts.item.view(), ""});
}

}  // namespace Vad
