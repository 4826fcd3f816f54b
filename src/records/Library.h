// A library clause: the library it names.
#pragma once

#include <string_view>

#include "CHdlElement.h"
#include "Identifiers.h"
#include "TPersistHelper.h"

namespace Vad {

class Library : public CHdlElement {
 public:
  // For the factory: everything empty, type 0 until a load restores it.
  Library();
  // Type Library; the library name is a copy of `name`.
  Library(std::string_view name, DbObject* parent);

  static const Port::XUID& ClassId() { return ClassIds::Library(); }

  ~Library() override = default;

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;
  CitI::Result Load(Prjrep::IArchive* archive) override;
  CitI::Result Save(Prjrep::IArchive* archive) override;

  const Port::StringBase& GetLibraryText() const { return libraryName_; }
  // "||Library|<library name>|", also kept as the store key.
  void ComposeStoreKey(Port::StringBase& key);
  // The store key a library of that name gets, without making the record.
  static void ComposeStoreKeyFor(std::string_view name, Port::StringBase& key);

 private:
  TPersistHelper<Library> persist_{this};
  Port::StringBase libraryName_;
};

}  // namespace Vad
