// A use clause: the library, package and item parts of its selected name.
#pragma once

#include <string_view>

#include "CHdlElement.h"
#include "Identifiers.h"
#include "TPersistHelper.h"

namespace Vad {

class Use : public CHdlElement {
 public:
  // For the factory: everything empty, type 0 until a load restores it.
  Use();
  // Type Use. `name` is the selected name: its first three dot-separated parts become the
  // library, package and item parts (missing parts stay empty, further ones are ignored).
  Use(std::string_view name, DbObject* parent);

  static const Port::XUID& ClassId() { return ClassIds::Use(); }

  ~Use() override = default;

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;
  // The results of the three part transfers are not checked: 1 once the base part succeeded.
  CitI::Result Load(Prjrep::IArchive* archive) override;
  CitI::Result Save(Prjrep::IArchive* archive) override;

  void SetParts(std::string_view library, std::string_view package, std::string_view item);
  const Port::StringBase& GetLibraryPart() const { return library_; }
  const Port::StringBase& GetPackagePart() const { return package_; }
  const Port::StringBase& GetItemPart() const { return item_; }
  // "||Use|<library>|<package>|<item>|", also kept as the store key.
  void ComposeStoreKey(Port::StringBase& key);
  // The store key a use clause of that selected name gets, without making the record.
  static void ComposeStoreKeyFor(std::string_view name, Port::StringBase& key);

 private:
  struct Parts {
    Port::StringBase library;
    Port::StringBase package;
    Port::StringBase item;
  };
  static Parts PartsOf(std::string_view name);
  static void JoinStoreKey(const Parts& parts, Port::StringBase& key);

  CitI::Result PersistParts(Prjrep::IArchive* archive, bool saving);

  TPersistHelper<Use> persist_{this};
  Port::StringBase library_;
  Port::StringBase package_;
  Port::StringBase item_;
};

}  // namespace Vad
