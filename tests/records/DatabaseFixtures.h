// Archives, source files and registrations for exercising the design-unit database.
#pragma once

#include <gtest/gtest.h>

#include <cstdint>
#include <deque>
#include <string>
#include <vector>

#include "DbObject.h"
#include "IHdlFile.h"
#include "IPersist.h"
#include "ISourceLibrary.h"
#include "ISourceLibraryMember.h"
#include "Identifiers.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/Casts.h"
#include "Prjrep/TFace.h"
#include "Prjrep/TRefCountHelper.h"
#include "RavA/Factory.h"

extern "C" void InstFactoryEntry();

namespace database_test {

// A counted object owned by the test: released when this goes out of scope.
template <class T>
class Owned : public Prjrep::AutoRelease<T> {
 public:
  using Prjrep::AutoRelease<T>::AutoRelease;
  T& operator*() const { return *this->Get(); }
};

// An archive that logs every operation and gives back on reading what was written, in order per
// kind of value. The operation with index `failAt` fails with kFailCode, and so does a read of a
// kind whose values are used up. Objects read are handed back as they were written (not loaded).
class ScriptArchive final : public Prjrep::IArchive {
 public:
  static constexpr CitI::Result kFailCode = 7;

  explicit ScriptArchive(std::int32_t version = 9) : version_(version) {}

  std::vector<std::string> log;
  int failAt = -1;

  // Puts an object in line for ReadObject.
  void QueueObject(CitI::IInterface* object) { objects_.push_back(object); }
  // The logged operations whose text starts with `prefix`.
  std::vector<std::string> Logged(const std::string& prefix) const {
    std::vector<std::string> found;
    for (const std::string& entry : log)
      if (entry.rfind(prefix, 0) == 0) found.push_back(entry);
    return found;
  }

  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    return id == IArchive::Iid() || id == CitI::IInterface::Iid() ? this : nullptr;
  }
  CitI::Result GetVersion(std::int32_t* version) override {
    if (!Step("GetVersion")) return kFailCode;
    *version = version_;
    return CitI::kOk;
  }
  CitI::Result WriteObject(Prjrep::IPersist* object) override {
    if (!Step("WriteObject " + NameOf(object))) return kFailCode;
    objects_.push_back(object);
    return object ? object->Save(this) : CitI::kFail;
  }
  CitI::Result ReadObject(CitI::IInterface** object) override {
    Prjrep::AutoOut<CitI::IInterface> out(object);
    if (!Step("ReadObject") || objects_.empty()) return kFailCode;
    out.Set(objects_.front());
    objects_.pop_front();
    return CitI::kOk;
  }
  CitI::Result WriteObjectRef(Prjrep::IPersist* object) override {
    if (!Step("WriteObjectRef " + NameOf(object))) return kFailCode;
    refs_.push_back(object);
    return CitI::kOk;
  }
  CitI::Result ReadObjectRef(CitI::IInterface** object) override {
    *object = nullptr;
    if (!Step("ReadObjectRef") || refs_.empty()) return kFailCode;
    *object = refs_.front();
    refs_.pop_front();
    return CitI::kOk;
  }
  CitI::Result WriteInt(std::int32_t value) override { return Write("WriteInt", ints_, value); }
  CitI::Result ReadInt(std::int32_t* value) override { return Read("ReadInt", ints_, value); }
  CitI::Result WriteInt64(std::int64_t value) override { return Write("WriteInt64", int64s_, value); }
  CitI::Result ReadInt64(std::int64_t* value) override { return Read("ReadInt64", int64s_, value); }
  CitI::Result WriteBool(bool value) override { return Write("WriteBool", bools_, value); }
  CitI::Result ReadBool(bool* value) override { return Read("ReadBool", bools_, value); }
  CitI::Result WriteString(const Port::StringBase& value) override {
    return Write("WriteString", strings_, value);
  }
  CitI::Result ReadString(Port::StringBase* value) override { return Read("ReadString", strings_, value); }
  CitI::Result WriteXUID(const Port::XUID& value) override { return Write("WriteXUID", xuids_, value); }
  CitI::Result ReadXUID(Port::XUID* value) override { return Read("ReadXUID", xuids_, value); }

 private:
  static std::string NameOf(Prjrep::IPersist* object) {
    auto* dbObject = Prjrep::ImplementationCast<Vad::DbObject>(object);
    if (!object) return "null";
    return dbObject ? dbObject->GetName().str() : "?";
  }
  static std::string Text(std::int32_t value) { return std::to_string(value); }
  static std::string Text(std::int64_t value) { return std::to_string(value); }
  static std::string Text(bool value) { return value ? "1" : "0"; }
  static std::string Text(const Port::StringBase& value) { return value.str(); }
  static std::string Text(const Port::XUID& value) { return value.ToString(); }

  bool Step(std::string entry) {
    log.push_back(std::move(entry));
    return static_cast<int>(log.size()) - 1 != failAt;
  }
  template <class T, class V>
  CitI::Result Write(const char* operation, std::deque<T>& values, const V& value) {
    if (!Step(std::string(operation) + " " + Text(value))) return kFailCode;
    values.push_back(value);
    return CitI::kOk;
  }
  template <class T, class V>
  CitI::Result Read(const char* operation, std::deque<T>& values, V* value) {
    if (!Step(operation) || values.empty()) return kFailCode;
    *value = static_cast<V>(values.front());
    values.pop_front();
    return CitI::kOk;
  }

  std::int32_t version_;
  std::deque<CitI::IInterface*> objects_;
  std::deque<CitI::IInterface*> refs_;
  std::deque<std::int64_t> ints_;
  std::deque<std::int64_t> int64s_;
  std::deque<bool> bools_;
  std::deque<Port::StringBase> strings_;
  std::deque<Port::XUID> xuids_;
};

// A source library that has no name interface.
class NamelessLibrary final : public Vad::ISourceLibrary {
 public:
  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    if (id == ISourceLibrary::Iid() || id == CitI::IInterface::Iid()) return this;
    if (id == Prjrep::IRefCount::Iid()) return &refs_;
    return nullptr;
  }
  CitI::Result GetName(Port::StringBase* out) override {
    *out = "hidden";
    return CitI::kOk;
  }
  CitI::Result SetName(const Port::StringBase&) override { return CitI::kOk; }

 private:
  Prjrep::TRefCountHelper<NamelessLibrary> refs_{this};
};

// A source file as a host or the project hands it to an element: IHdlFile and, unless told
// otherwise, ISourceLibraryMember with the library it was given.
class FakeSourceFile final : public Vad::IHdlFile {
 public:
  explicit FakeSourceFile(bool isLibraryMember = true) : isLibraryMember_(isLibraryMember) {}

  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    if (id == IHdlFile::Iid() || id == CitI::IInterface::Iid()) return this;
    if (id == Vad::ISourceLibraryMember::Iid() && isLibraryMember_) return &member_;
    if (id == Prjrep::IRefCount::Iid()) return &refs_;
    return nullptr;
  }

  // The file's own operations are not used by design-unit elements.
  CitI::Result parseIfNeeded() override { return CitI::kNotImpl; }
  CitI::Result setNeedsParse(bool) override { return CitI::kNotImpl; }
  CitI::Result getProject(Vad::IHdlProject**) override { return CitI::kNotImpl; }
  CitI::Result setFilePath(const Port::StringBase&, const Port::StringBase&) override {
    return CitI::kNotImpl;
  }
  CitI::Result getFileName(Port::StringBase*, Port::StringBase*) override { return CitI::kNotImpl; }
  CitI::Result getDesignUnits(CitI::IInterface*, Vad::IHdlDesignUnitIterator**) override {
    return CitI::kNotImpl;
  }
  CitI::Result Reserved8(CitI::IInterface*, CitI::IInterface**) override { return CitI::kNotImpl; }
  CitI::Result getResultText(Port::StringBase*) override { return CitI::kNotImpl; }
  CitI::Result setPluginName(const Port::StringBase&) override { return CitI::kNotImpl; }
  CitI::Result getPluginName(Port::StringBase*) override { return CitI::kNotImpl; }
  CitI::Result getOrderKey(std::uint64_t*) override { return CitI::kNotImpl; }
  CitI::Result getOrderKeyAlias(std::uint64_t*) override { return CitI::kNotImpl; }
  CitI::Result setOrderKey(std::uint64_t) override { return CitI::kNotImpl; }
  CitI::Result getNeedsParse(bool*) override { return CitI::kNotImpl; }

 private:
  class Member final : public Prjrep::TFace<Vad::ISourceLibraryMember, FakeSourceFile> {
   public:
    using TFace::TFace;
    CitI::Result getSourceLibrary(Vad::ISourceLibrary** out) override {
      return owner()->library_.CopyTo(out);
    }
    CitI::Result setSourceLibrary(CitI::IInterface* library) override {
      owner()->library_ = library;
      return CitI::kOk;
    }
  };

  bool isLibraryMember_;
  Prjrep::AutoPtr<Vad::ISourceLibrary> library_;
  Member member_{this};
  Prjrep::TRefCountHelper<FakeSourceFile> refs_{this};
};

// Registers the module's factories for the test and empties the registry afterwards.
class RegisteredModule : public testing::Test {
 protected:
  void SetUp() override { InstFactoryEntry(); }
  void TearDown() override { RavA::Factory::Clear(); }
};

}  // namespace database_test
