// The root of the design database: a counted object with a type code, a name, a store key, a
// parent and owned children, that saves itself to and loads itself from the host's archive.
#pragma once

#include <cstddef>
#include <cstdint>
#include <initializer_list>
#include <string_view>
#include <vector>

#include "CitI.h"
#include "IPersist.h"
#include "Port/StringBase.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/TRefCountHelper.h"

namespace Vad {

// Design-object type codes are single bits, so that a set of kinds is a mask.
namespace DbType {
inline constexpr std::uint32_t kFile = 1;
inline constexpr std::uint32_t kEntity = 2;
inline constexpr std::uint32_t kArchitecture = 4;
inline constexpr std::uint32_t kComponentInstantiation = 8;
inline constexpr std::uint32_t kEntityInstantiation = 16;
inline constexpr std::uint32_t kLibrary = 32;
inline constexpr std::uint32_t kPackageDecl = 64;
inline constexpr std::uint32_t kPackageBody = 128;
inline constexpr std::uint32_t kUse = 256;
inline constexpr std::uint32_t kInclude = 512;
inline constexpr std::uint32_t kProject = 1024;
inline constexpr std::uint32_t kIncludedFile = 2048;
inline constexpr std::uint32_t kParserConfigHolder = 4096;
inline constexpr std::uint32_t kModule = 8192;
inline constexpr std::uint32_t kGeneric = 16384;
// Entity, Architecture, PackageDecl, PackageBody, Module, Generic.
inline constexpr std::uint32_t kDesignUnitKinds = 0x60C6;
}  // namespace DbType

// Counted through its Prjrep::TRefCountHelper (count 1 at construction, held by the creator).
// QueryInterface answers Prjrep::IRefCount with the counter and IInterface and the
// implementation identity with the object itself; it takes no reference.
class DbObject : public CitI::IInterface {
 public:
  // Type 0, no children, an empty store key; registers under `parent` (which then holds one
  // reference) when it is non-null.
  DbObject(std::string_view name, DbObject* parent);
  // Releases each child's reference in list order; a child that outlives this object loses its
  // back pointer to it.
  ~DbObject() override;
  DbObject(const DbObject&) = delete;
  DbObject& operator=(const DbObject&) = delete;

  CitI::IInterface* QueryInterface(const Port::XUID& id) override;
  // The text under which the elaborator knows the unit; here the type name alone.
  virtual void GetDesignUnitKey(Port::StringBase& out) const;

  void SetType(std::uint32_t type) { type_ = type; }
  std::uint32_t GetType() const { return type_; }
  DbObject* GetParent() const { return parent_; }
  const Port::StringBase& GetName() const { return name_; }
  const Port::StringBase& GetKey() const { return key_; }
  void SetKey(std::string_view key) { key_ = key; }

  // The children in insertion order, as DbObject pointers, for range-for.
  class ChildView;
  ChildView GetChildren() const;
  std::size_t GetChildCount() const { return children_.size(); }

  // Sets the back pointer and, for a non-null parent, appends this object to the parent's
  // children. A previous parent keeps its entry.
  void SetParent(DbObject* parent);
  // Takes one reference on `child`, appends it (duplicates are not checked) and makes this
  // object its parent. Null is ignored.
  void AddChild(DbObject* child);

  // "Unknown" for 0, for a combination of bits and for any value outside the table.
  static const char* TypeNameOf(std::uint32_t type);
  const char* GetTypeName() const { return TypeNameOf(type_); }
  // Appends "<key>|<type name>|" to `key`; every caller passes it empty, which gives the store-key
  // prefix "|<type name>|".
  void AppendKeyPrefix(Port::StringBase& key) const;
  // `key` becomes the fields with a '|' between each two. A parse makes a key for every record,
  // so this is plain appending rather than formatting.
  static void JoinKeyFields(Port::StringBase& key, std::initializer_list<std::string_view> fields);

  // Saves or loads type, parent reference, owned children, name, store key and a reserved flag.
  // The first archive result other than 1 is returned unchanged.
  CitI::Result PersistObject(Prjrep::IArchive* archive, bool saving);

 protected:
  void SetName(std::string_view name) { name_ = name; }
  // For records that persist the name a second time.
  Port::StringBase& NameField() { return name_; }

 private:
  struct Child {
    DbObject* object;
    Prjrep::AutoPtr<CitI::IInterface> reference;  // the list's one reference
  };

  CitI::Result SaveObject(Prjrep::IArchive* archive);
  CitI::Result LoadObject(Prjrep::IArchive* archive);
  CitI::Result SaveChildren(Prjrep::IArchive* archive);
  CitI::Result LoadChildren(Prjrep::IArchive* archive);

  std::uint32_t type_ = 0;
  DbObject* parent_ = nullptr;  // back pointer, no reference
  std::vector<Child> children_;

 public:
  // A hand-made view: the standard library's transform view does not compile with every
  // compiler we build with (the fuzzing build uses clang).
  class ChildView {
   public:
    class Iterator {
     public:
      explicit Iterator(std::vector<Child>::const_iterator at) : at_(at) {}
      DbObject* operator*() const { return at_->object; }
      Iterator& operator++() {
        ++at_;
        return *this;
      }
      bool operator!=(const Iterator& other) const { return at_ != other.at_; }

     private:
      std::vector<Child>::const_iterator at_;
    };
    explicit ChildView(const std::vector<Child>& children) : children_(children) {}
    Iterator begin() const { return Iterator(children_.begin()); }
    Iterator end() const { return Iterator(children_.end()); }

   private:
    const std::vector<Child>& children_;
  };

 private:
  Port::StringBase name_;
  Port::StringBase key_;
  Prjrep::TRefCountHelper<DbObject> refCount_{this};
};

inline DbObject::ChildView DbObject::GetChildren() const { return ChildView(children_); }

}  // namespace Vad
