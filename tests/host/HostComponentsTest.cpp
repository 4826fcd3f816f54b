#include <gtest/gtest.h>

#include <fstream>

#include "Host/DataStore.h"
#include "Host/EventReceiver.h"
#include "Host/FileType.h"
#include "Host/HostComponents.h"
#include "IBaseServices.h"
#include "IDataStore.h"
#include "IDesignUnitTypeStore.h"
#include "IEventSender.h"
#include "IFile.h"
#include "IFileNameHelper.h"
#include "IName.h"
#include "ISourceLibrary.h"
#include "Prjrep/AutoPtr.h"
#include "Prjrep/Casts.h"
#include "RavA/Factory.h"
#include "ScopedTempDir.h"

namespace {

using Port::StringBase;
using Prjrep::AutoPtr;
using Prjrep::AutoRelease;

const Port::XUID kEntityType("{0D6B2E6A-3F0B-4C55-9F3E-6A1F2C7B8E01}");
const Port::XUID kModuleType("{0D6B2E6A-3F0B-4C55-9F3E-6A1F2C7B8E02}");

class HostComponents : public testing::Test {
 protected:
  void SetUp() override { ASSERT_TRUE(Host::RegisterHostComponents()); }

  static AutoPtr<Prjrep::IFileNameHelper> NewHelper() {
    return Prjrep::CreateInstanceAs<Prjrep::IFileNameHelper>(Vad::ClassIds::HostFileNameHelper());
  }
  static AutoPtr<Vad::IDataStore> DataStoreFromBaseServices() {
    auto services = Prjrep::CreateInstanceAs<Vad::IBaseServices>(Vad::ClassIds::HostBaseServices());
    if (!services) return nullptr;
    AutoRelease<CitI::IInterface> service;
    if (services->GetService(Vad::InterfaceIds::DataStoreService(), service.Out()) != CitI::kOk)
      return nullptr;
    return AutoPtr<Vad::IDataStore>(service.Get());
  }
};

struct PathParts {
  StringBase full, directory, fileName, base, extension;
};

PathParts PartsOf(Prjrep::IFileNameHelper* helper) {
  PathParts parts;
  EXPECT_EQ(helper->GetFullPath(&parts.full), CitI::kOk);
  EXPECT_EQ(helper->GetDirectory(&parts.directory), CitI::kOk);
  EXPECT_EQ(helper->GetFileName(&parts.fileName), CitI::kOk);
  EXPECT_EQ(helper->GetBaseName(&parts.base), CitI::kOk);
  EXPECT_EQ(helper->GetExtension(&parts.extension), CitI::kOk);
  return parts;
}

StringBase FullPathOf(Prjrep::IFileNameHelper* helper, std::string_view path, std::string_view baseDir,
                      std::string_view cwd) {
  EXPECT_EQ(helper->SetFilePath(path, baseDir, cwd), CitI::kOk) << path;
  StringBase full;
  helper->GetFullPath(&full);
  return full;
}

TEST_F(HostComponents, FileNameHelperResolvesRelativePathsAgainstBaseDirThenCwd) {
  auto helper = NewHelper();
  ASSERT_TRUE(helper);
  EXPECT_EQ(FullPathOf(helper.Get(), "src/top.v", "/proj", "/home/u"), "/proj/src/top.v");
  EXPECT_EQ(FullPathOf(helper.Get(), "top.v", "proj", "/home/u"), "/home/u/proj/top.v");
  EXPECT_EQ(FullPathOf(helper.Get(), "../lib/./top.v", "", "/home/u/work"), "/home/u/lib/top.v");
  EXPECT_EQ(FullPathOf(helper.Get(), "/x/top.v", "/proj", "/home/u"), "/x/top.v");
  EXPECT_EQ(FullPathOf(helper.Get(), "top.v", "", ""), "top.v");

  ASSERT_EQ(helper->SetFilePath("rtl/top.v", "/proj", "/home/u"), CitI::kOk);
  StringBase given;
  bool absolute = true;
  EXPECT_EQ(helper->GetFilePath(&given), CitI::kOk);
  EXPECT_EQ(given, "rtl/top.v");
  EXPECT_EQ(helper->IsAbsolute(&absolute), CitI::kOk);
  EXPECT_FALSE(absolute);

  EXPECT_EQ(helper->SetFilePath("", "/proj", "/home/u"), CitI::kInvalidArg);
  EXPECT_EQ(PartsOf(helper.Get()).full, "/proj/rtl/top.v");
}

TEST_F(HostComponents, FileNameHelperTakesTheFullPathApart) {
  auto helper = NewHelper();
  ASSERT_TRUE(helper);
  // The parts come from Port::FileName; these distinguish every part and the empty extension.
  const std::pair<const char*, const char*> cases[] = {{"/x/y/top.tar.gz", "/x/y/|top.tar.gz|top.tar|gz"},
                                                       {"/x/a.b/c", "/x/a.b/|c|c|"}};
  for (const auto& [path, expected] : cases) {
    helper->SetFilePath(path, "", "/cwd");
    PathParts parts = PartsOf(helper.Get());
    EXPECT_EQ(parts.full, path);
    EXPECT_EQ(parts.directory + "|" + parts.fileName.view() + "|" + parts.base.view() + "|" +
                  parts.extension.view(),
              expected);
  }
}

TEST_F(HostComponents, FileNameHelperRefusesNullOutParameters) {
  auto helper = NewHelper();
  ASSERT_TRUE(helper);
  bool flag = false;
  std::int64_t seconds = 0;
  EXPECT_EQ(helper->GetFullPath(nullptr), CitI::kInvalidArg);
  EXPECT_EQ(helper->GetBaseName(nullptr), CitI::kInvalidArg);
  EXPECT_EQ(helper->GetExtension(nullptr), CitI::kInvalidArg);
  EXPECT_EQ(helper->Exists(nullptr), CitI::kInvalidArg);
  EXPECT_EQ(helper->GetModificationTime(nullptr), CitI::kInvalidArg);
  EXPECT_EQ(helper->GetRelativePath("/x", nullptr), CitI::kInvalidArg);
  EXPECT_EQ(helper->IsSameFile(nullptr, &flag), CitI::kInvalidArg);
  EXPECT_EQ(helper->IsSameFile(helper.Get(), nullptr), CitI::kInvalidArg);
  EXPECT_EQ(helper->GetModificationTime(&seconds), CitI::kFail);  // no path yet
}

TEST_F(HostComponents, FileNameHelperExtensionsRelativePathsAndIdentity) {
  auto helper = NewHelper();
  auto other = NewHelper();
  ASSERT_TRUE(helper && other);
  helper->SetFilePath("src/top.v", "/proj", "/cwd");

  StringBase relative;
  EXPECT_EQ(helper->GetRelativePath("/proj/lib/", &relative), CitI::kOk);
  EXPECT_EQ(relative, "../src/top.v");
  EXPECT_EQ(helper->GetRelativePath("/proj/src", &relative), CitI::kOk);
  EXPECT_EQ(relative, "top.v");
  EXPECT_EQ(helper->GetRelativePath("/proj/src/top.v", &relative), CitI::kOk);
  EXPECT_EQ(relative, ".");
  EXPECT_EQ(helper->GetRelativePath("proj", &relative), CitI::kInvalidArg);

  bool has = false;
  EXPECT_EQ(helper->HasExtension(".V", &has), CitI::kOk);
  EXPECT_TRUE(has);
  EXPECT_EQ(helper->SetExtension("vhd"), CitI::kOk);
  StringBase given;
  helper->GetFilePath(&given);
  EXPECT_EQ(given, "src/top.vhd");
  EXPECT_EQ(PartsOf(helper.Get()).full, "/proj/src/top.vhd");
  EXPECT_EQ(helper->SetExtension("a/b"), CitI::kInvalidArg);
  EXPECT_EQ(helper->SetExtension(""), CitI::kOk);
  EXPECT_EQ(PartsOf(helper.Get()).full, "/proj/src/top");

  bool same = true;
  other->SetFilePath("/proj/src/top", "", "/cwd");
  EXPECT_EQ(helper->IsSameFile(other.Get(), &same), CitI::kOk);
  EXPECT_TRUE(same);
  other->Clear();
  EXPECT_EQ(helper->IsSameFile(other.Get(), &same), CitI::kOk);
  EXPECT_FALSE(same);
  bool empty = false;
  other->IsEmpty(&empty);
  EXPECT_TRUE(empty);
  EXPECT_EQ(other->SetExtension("v"), CitI::kFail);
}

TEST_F(HostComponents, FileNameHelperLooksAtTheFileItself) {
  auto helper = NewHelper();
  ASSERT_TRUE(helper);
  bool exists = false;
  std::int64_t seconds = 0;
  ScopedTempDir dir;
  const std::string path = dir.Path("top.v");
  std::ofstream(path) << "module top; endmodule\n";
  helper->SetFilePath(path.c_str(), "", "/");
  EXPECT_EQ(helper->Exists(&exists), CitI::kOk);
  EXPECT_TRUE(exists);
  EXPECT_EQ(helper->GetModificationTime(&seconds), CitI::kOk);
  EXPECT_GT(seconds, 0);

  helper->SetFilePath("/no/such/dir/top.v", "", "/");
  EXPECT_EQ(helper->Exists(&exists), CitI::kOk);
  EXPECT_FALSE(exists);
  EXPECT_EQ(helper->GetModificationTime(&seconds), CitI::kFail);
  EXPECT_EQ(seconds, 0);
}

TEST_F(HostComponents, BaseServicesLeadToOneTypeObjectPerTypeAndFileType) {
  auto store = DataStoreFromBaseServices();
  ASSERT_TRUE(store);
  AutoPtr<Vad::IDesignUnitTypeStore> types(store.Get());
  ASSERT_TRUE(types);
  auto vhdl = Host::FileType::Create("VHDL", {"vhd"});
  auto verilog = Host::FileType::Create("Verilog", {"v"});

  AutoRelease<Vad::IDesignUnitType> first, second, otherFileType, otherType;
  EXPECT_EQ(types->GetDesignUnitType(kEntityType, vhdl.Get(), first.Out()), CitI::kOk);
  EXPECT_EQ(types->GetDesignUnitType(kEntityType, vhdl.Get(), second.Out()), CitI::kOk);
  ASSERT_TRUE(first);
  EXPECT_EQ(first.Get(), second.Get());
  types->GetDesignUnitType(kEntityType, verilog.Get(), otherFileType.Out());
  types->GetDesignUnitType(kModuleType, vhdl.Get(), otherType.Out());
  EXPECT_NE(otherFileType.Get(), first.Get());
  EXPECT_NE(otherType.Get(), first.Get());
  std::uint32_t count = 0;
  types->GetTypeCount(&count);
  EXPECT_EQ(count, 3u);

  Port::XUID typeId;
  StringBase name, fileTypeName;
  EXPECT_EQ(first->GetTypeId(&typeId), CitI::kOk);
  EXPECT_EQ(typeId, kEntityType);
  first->GetFileTypeName(&fileTypeName);
  EXPECT_EQ(fileTypeName, "VHDL");
  first->GetName(&name);
  EXPECT_EQ(name, kEntityType.ToString());
  EXPECT_EQ(types->SetTypeName(kEntityType, "Entity"), CitI::kOk);
  first->GetName(&name);
  EXPECT_EQ(name, "Entity");
  otherFileType->GetName(&name);
  EXPECT_EQ(name, "Entity");
}

TEST_F(HostComponents, TypeStoreAndBaseServicesRefuseBadArguments) {
  auto services = Prjrep::CreateInstanceAs<Vad::IBaseServices>(Vad::ClassIds::HostBaseServices());
  ASSERT_TRUE(services);
  AutoRelease<CitI::IInterface> service;
  EXPECT_EQ(services->GetService(kEntityType, service.Out()), CitI::kFail);
  EXPECT_FALSE(service);
  EXPECT_EQ(services->GetService(Vad::InterfaceIds::DataStoreService(), nullptr), CitI::kInvalidArg);

  AutoPtr<Vad::IDesignUnitTypeStore> types(DataStoreFromBaseServices().Get());
  ASSERT_TRUE(types);
  AutoRelease<Vad::IDesignUnitType> type;
  auto vhdl = Host::FileType::Create("VHDL");
  EXPECT_EQ(types->GetDesignUnitType(kEntityType, nullptr, type.Out()), CitI::kInvalidArg);
  EXPECT_FALSE(type);
  EXPECT_EQ(types->GetDesignUnitType(kEntityType, vhdl.Get(), nullptr), CitI::kInvalidArg);
  EXPECT_EQ(types->SetTypeName(kEntityType, ""), CitI::kInvalidArg);
  StringBase name;
  EXPECT_EQ(types->GetTypeName(kModuleType, &name), CitI::kFail);
}

TEST_F(HostComponents, DataStoreIsSharedWhileHeldAndGoneWhenReleased) {
  auto store = DataStoreFromBaseServices();
  ASSERT_TRUE(store);
  EXPECT_EQ(store->SetValue("key", "value"), CitI::kOk);
  EXPECT_EQ(store->SetValue("", "value"), CitI::kInvalidArg);
  auto fromFactory = Prjrep::CreateInstanceAs<Vad::IDataStore>(Host::ClassIds::DataStore());
  EXPECT_EQ(fromFactory.Get(), store.Get());
  EXPECT_EQ(DataStoreFromBaseServices().Get(), store.Get());

  StringBase value;
  EXPECT_EQ(store->GetValue("key", &value), CitI::kOk);
  EXPECT_EQ(value, "value");
  EXPECT_EQ(store->RemoveValue("key"), CitI::kOk);
  EXPECT_EQ(store->RemoveValue("key"), CitI::kFail);
  EXPECT_EQ(store->GetValue("key", &value), CitI::kFail);
  EXPECT_EQ(value, "");

  store->SetValue("kept", "only while held");
  store = nullptr;
  fromFactory = nullptr;
  auto fresh = Host::DataStore::Shared();
  std::uint32_t count = 1;
  fresh->GetValueCount(&count);
  EXPECT_EQ(count, 0u);
}

TEST_F(HostComponents, SourceLibraryAnswersINameWithItsName) {
  auto library = Prjrep::CreateInstanceAs<Vad::ISourceLibrary>(Host::ClassIds::SourceLibrary());
  ASSERT_TRUE(library);
  AutoPtr<Prjrep::IName> name(library.Get());
  ASSERT_TRUE(name);
  StringBase text;
  EXPECT_EQ(name->GetName(&text), CitI::kOk);
  EXPECT_EQ(text, "work");

  EXPECT_EQ(library->SetName("ieee"), CitI::kOk);
  name->GetName(&text);
  EXPECT_EQ(text, "ieee");
  EXPECT_EQ(name->SetName("basecell"), CitI::kOk);
  library->GetName(&text);
  EXPECT_EQ(text, "basecell");
  EXPECT_EQ(name->SetName(""), CitI::kInvalidArg);
  EXPECT_EQ(name->GetName(nullptr), CitI::kInvalidArg);
  EXPECT_EQ(Prjrep::QueryAs<Vad::ISourceLibrary>(name.Get()), library.Get());
}

TEST_F(HostComponents, FileTypeMatchesItsExtensionsIgnoringCase) {
  auto fileType = Prjrep::CreateInstanceAs<Vad::IFileType>(Host::ClassIds::FileType());
  ASSERT_TRUE(fileType);
  EXPECT_EQ(fileType->SetName("VHDL"), CitI::kOk);
  EXPECT_EQ(fileType->AddExtension("vhd"), CitI::kOk);
  EXPECT_EQ(fileType->AddExtension(".vhdl"), CitI::kOk);
  EXPECT_EQ(fileType->AddExtension("VHD"), CitI::kOk);
  EXPECT_EQ(fileType->AddExtension("."), CitI::kInvalidArg);
  std::uint32_t count = 0;
  fileType->GetExtensionCount(&count);
  EXPECT_EQ(count, 2u);
  StringBase extension;
  EXPECT_EQ(fileType->GetExtension(1, &extension), CitI::kOk);
  EXPECT_EQ(extension, "vhdl");
  EXPECT_EQ(fileType->GetExtension(2, &extension), CitI::kInvalidArg);

  bool matches = false;
  fileType->MatchesPath("/x/top.VHD", &matches);
  EXPECT_TRUE(matches);
  fileType->MatchesPath("/x/top.v", &matches);
  EXPECT_FALSE(matches);
  fileType->MatchesPath("/x/vhd", &matches);
  EXPECT_FALSE(matches);
}

TEST_F(HostComponents, FileComponentKeepsItsPath) {
  auto file = Prjrep::CreateInstanceAs<Vad::IFile>(Host::ClassIds::FileComponent());
  ASSERT_TRUE(file);
  StringBase path;
  EXPECT_EQ(file->SetPath("/x/top.v"), CitI::kOk);
  EXPECT_EQ(file->GetPath(&path), CitI::kOk);
  EXPECT_EQ(path, "/x/top.v");
  EXPECT_EQ(file->GetPath(nullptr), CitI::kInvalidArg);
  EXPECT_EQ(file->QueryInterface(Vad::InterfaceIds::IDesignUnit()), nullptr);
}

class FakeSender final : public Prjrep::IEventSender {
 public:
  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    return id == Prjrep::IEventSender::Iid() || id == CitI::IInterface::Iid() ? this : nullptr;
  }
  CitI::Result AddReceiver(Prjrep::IEventReceiver*) override { return CitI::kNotImpl; }
  CitI::Result RemoveReceiver(Prjrep::IEventReceiver*) override { return CitI::kNotImpl; }
  bool SendEvent(CitI::IInterface*) override { return false; }
  CitI::Result Compact() override { return CitI::kNotImpl; }
};

TEST_F(HostComponents, EventReceiverRecordsEventsAttachesAndDetaches) {
  auto receiver = Prjrep::CreateInstanceAs<Prjrep::IEventReceiver>(Host::ClassIds::EventReceiver());
  ASSERT_TRUE(receiver);
  auto* recorder = Prjrep::ObjectCast<Host::EventReceiver>(receiver.Get());
  ASSERT_NE(recorder, nullptr);
  FakeSender sender, stranger;
  auto event = Host::FileType::Create("event");

  EXPECT_EQ(receiver->OnAttach(&sender), CitI::kOk);
  EXPECT_TRUE(recorder->IsAttachedTo(&sender));
  EXPECT_EQ(receiver->OnEvent(event.Get()), CitI::kOk);
  EXPECT_EQ(receiver->OnEvent(nullptr), CitI::kInvalidArg);
  ASSERT_EQ(recorder->EventCount(), 1u);
  EXPECT_EQ(recorder->EventAt(0), event.Get());
  EXPECT_EQ(recorder->EventAt(1), nullptr);
  EXPECT_EQ(Prjrep::RefCountOf(event.Get()), 2u);

  EXPECT_EQ(receiver->OnDetach(&stranger), CitI::kFail);
  EXPECT_EQ(receiver->OnDetach(&sender), CitI::kOk);
  EXPECT_FALSE(recorder->IsAttachedTo(&sender));
  EXPECT_EQ(recorder->AttachCount(), 1u);
  EXPECT_EQ(recorder->DetachCount(), 1u);

  receiver = nullptr;
  EXPECT_EQ(Prjrep::RefCountOf(event.Get()), 1u);
}

TEST_F(HostComponents, RegistrationIsIdempotentAndUndoable) {
  std::size_t registered = RavA::Factory::RegisteredClasses().size();
  EXPECT_TRUE(Host::RegisterHostComponents());
  EXPECT_EQ(RavA::Factory::RegisteredClasses().size(), registered);

  Host::UnregisterHostComponents();
  EXPECT_FALSE(RavA::Factory::IsRegistered(Vad::ClassIds::HostFileNameHelper()));
  EXPECT_FALSE(NewHelper());
  EXPECT_TRUE(Host::RegisterHostComponents());
  EXPECT_TRUE(NewHelper());
}

}  // namespace
