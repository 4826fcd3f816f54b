#include <gtest/gtest.h>

#include "Host/FileComponent.h"
#include "Host/FileNameHelper.h"
#include "Port/MsgManData.h"
#include "Prjrep/RefCounting.h"
#include "RavA/Factory.h"
#include "TFactory.h"
#include "TestHost.h"
#include "generic.h"

using namespace test_host;

namespace {

// A file-name helper whose parts need not agree, as a host's may not.
class FixedPartsHelper final : public Prjrep::IFileNameHelper {
 public:
  static inline Port::StringBase fullPath;
  static inline Port::StringBase baseName;
  static inline Port::StringBase extension;

  CitI::IInterface* QueryInterface(const Port::XUID& id) override {
    if (id == Prjrep::IFileNameHelper::Iid() || id == CitI::IInterface::Iid()) return this;
    if (id == Prjrep::IRefCount::Iid()) return &refs_;
    return nullptr;
  }
  CitI::Result SetFilePath(const Port::StringBase&, const Port::StringBase&,
                           const Port::StringBase&) override {
    return CitI::kOk;
  }
  CitI::Result GetFilePath(Port::StringBase* out) override { return Copy(fullPath, out); }
  CitI::Result GetDirectory(Port::StringBase*) override { return CitI::kFail; }
  CitI::Result GetFileName(Port::StringBase*) override { return CitI::kFail; }
  CitI::Result IsAbsolute(bool*) override { return CitI::kFail; }
  CitI::Result Exists(bool*) override { return CitI::kFail; }
  CitI::Result GetFullPath(Port::StringBase* out) override { return Copy(fullPath, out); }
  CitI::Result GetModificationTime(std::int64_t*) override { return CitI::kFail; }
  CitI::Result GetRelativePath(const Port::StringBase&, Port::StringBase*) override { return CitI::kFail; }
  CitI::Result GetBaseName(Port::StringBase* out) override { return Copy(baseName, out); }
  CitI::Result GetExtension(Port::StringBase* out) override { return Copy(extension, out); }
  CitI::Result SetExtension(const Port::StringBase&) override { return CitI::kFail; }
  CitI::Result HasExtension(const Port::StringBase&, bool*) override { return CitI::kFail; }
  CitI::Result IsEmpty(bool*) override { return CitI::kFail; }
  CitI::Result Clear() override { return CitI::kFail; }
  CitI::Result IsSameFile(Prjrep::IFileNameHelper*, bool*) override { return CitI::kFail; }

 private:
  static CitI::Result Copy(const Port::StringBase& value, Port::StringBase* out) {
    if (!out) return CitI::kInvalidArg;
    *out = value;
    return CitI::kOk;
  }
  Prjrep::TRefCountHelper<> refs_{this};
};

// While it lives, new files get the fixed-parts helper (or none at all); the host's helper comes
// back afterwards.
class ScopedHelperFactory {
 public:
  explicit ScopedHelperFactory(bool withHelper) {
    RavA::Factory::UnregisterFactory(Vad::ClassIds::HostFileNameHelper());
    if (!withHelper) return;
    Prjrep::AutoRelease<CitI::IFactory> factory(
        new Port::TFactory<FixedPartsHelper, &Vad::ClassIds::HostFileNameHelper>());
    RavA::Factory::RegisterFactory(Vad::ClassIds::HostFileNameHelper(), factory.Get());
  }
  ~ScopedHelperFactory() {
    RavA::Factory::UnregisterFactory(Vad::ClassIds::HostFileNameHelper());
    Host::RegisterHostComponents();
  }
};

class HdlFile : public PipelineTest {
 protected:
  void SetUp() override { project_ = NewProject(); }

  Prjrep::AutoPtr<Vad::IHdlFile> NewBareFile() {
    return Prjrep::CreateInstanceAs<Vad::IHdlFile>(Vad::ClassIds::CHdlFile());
  }

  static bool UpToDate(Vad::IHdlFile* file) {
    bool upToDate = true;
    EXPECT_EQ(FileObject(file)->isUpToDate(&upToDate, nullptr), CitI::kOk);
    return upToDate;
  }

  // The unit object itself, so that units can be compared by identity.
  static CitI::IInterface* OnlyUnit(Vad::IHdlFile* file) {
    auto units = UnitsOf(FileObject(file)->GetUnitSet());
    return units.size() == 1 ? Prjrep::QueryAs<CitI::IInterface>(units[0]) : nullptr;
  }

  Prjrep::AutoPtr<Vad::IHdlProject> project_;
};

// Parts longer than the full path: nothing is cut past its start.
TEST_F(HdlFile, FileNameCutsTheNameFromTheHelpersFullPath) {
  ScopedHelperFactory helpers(true);
  auto file = NewBareFile();
  const std::vector<std::vector<const char*>> cases{
      {"C:/x/top.v", "top", "v", "C:/x/", "top.v"},
      {"C:/x/Makefile", "Makefile", "", "C:/x/", "Makefile"},
      {"a", "longer", "", "", "longer"},
  };
  for (const auto& c : cases) {
    FixedPartsHelper::fullPath = c[0];
    FixedPartsHelper::baseName = c[1];
    FixedPartsHelper::extension = c[2];
    Port::StringBase directory, name;
    ASSERT_EQ(file->getFileName(&directory, &name), CitI::kOk);
    EXPECT_EQ(directory, c[3]) << c[0];
    EXPECT_EQ(name, c[4]) << c[0];
  }
  Port::StringBase name;
  EXPECT_EQ(file->getFileName(nullptr, &name), CitI::kInvalidArg);
}

TEST_F(HdlFile, WithoutAFileNameHelperPathOperationsFail) {
  ScopedHelperFactory noHelpers(false);
  auto file = NewBareFile();
  ASSERT_TRUE(file);
  Port::StringBase directory, name;
  EXPECT_EQ(file->setFilePath("/x/top.v", ""), CitI::kFail);
  EXPECT_EQ(file->getFileName(&directory, &name), CitI::kFail);
  auto* names = Prjrep::QueryAs<Prjrep::IFileNameHelper>(file.Get());
  EXPECT_EQ(names->GetFullPath(&name), CitI::kFail);
}

TEST_F(HdlFile, PathOperationsReachTheHelperThroughTheFilesOwnFace) {
  auto file = NewBareFile();
  ASSERT_EQ(file->setFilePath("top.v", "/work/proj"), CitI::kOk);
  auto* names = Prjrep::QueryAs<Prjrep::IFileNameHelper>(file.Get());
  Port::StringBase text;
  EXPECT_EQ(names->GetFullPath(&text), CitI::kOk);
  EXPECT_EQ(text, "/work/proj/top.v");
  EXPECT_EQ(names->GetFilePath(&text), CitI::kOk);
  EXPECT_EQ(text, "top.v");
  EXPECT_EQ(names->SetFilePath("/other/a.vhd", "", "/"), CitI::kOk);
  Port::StringBase directory;
  ASSERT_EQ(file->getFileName(&directory, &text), CitI::kOk);
  EXPECT_EQ(directory, "/other/");
  EXPECT_EQ(text, "a.vhd");
  EXPECT_EQ(names->GetBaseName(nullptr), CitI::kInvalidArg);
}

TEST_F(HdlFile, KeysFlagsAndNamesAreStoredAsGiven) {
  auto file = NewBareFile();
  std::uint64_t key = 0, alias = 0;
  EXPECT_EQ(file->setOrderKey(0xFFFFFFFF00000001ull), CitI::kOk);
  EXPECT_EQ(file->getOrderKey(&key), CitI::kOk);
  EXPECT_EQ(file->getOrderKeyAlias(&alias), CitI::kOk);
  EXPECT_EQ(key, 0xFFFFFFFF00000001ull);
  EXPECT_EQ(alias, key);
  EXPECT_EQ(file->getOrderKey(nullptr), CitI::kOk);
  Port::StringBase plugin;
  EXPECT_EQ(file->setPluginName("PLUGIN_Verilog"), CitI::kOk);
  EXPECT_EQ(file->getPluginName(&plugin), CitI::kOk);
  EXPECT_EQ(plugin, "PLUGIN_Verilog");

  bool v3 = true, needsParse = false;
  auto* v3Face = Prjrep::QueryAs<Vad::IHdlFileV3>(file.Get());
  EXPECT_EQ(v3Face->getV3Flag(&v3), CitI::kOk);
  EXPECT_EQ(file->getNeedsParse(&needsParse), CitI::kOk);
  EXPECT_FALSE(v3);
  EXPECT_TRUE(needsParse);
  EXPECT_EQ(v3Face->setV3Flag(true), CitI::kOk);
  EXPECT_EQ(file->setNeedsParse(false), CitI::kOk);
  v3Face->getV3Flag(&v3);
  file->getNeedsParse(&needsParse);
  EXPECT_TRUE(v3);
  EXPECT_FALSE(needsParse);
  Prjrep::AutoPtr<CitI::IInterface> none;
  EXPECT_EQ(file->Reserved8(nullptr, none.Out()), CitI::kNotImpl);
  EXPECT_FALSE(none);
}

TEST_F(HdlFile, InitializeAfterCreateWantsAFileType) {
  auto file = NewBareFile();
  auto* admin = Prjrep::QueryAs<Vad::ICompAdmin>(file.Get());
  ASSERT_NE(admin, nullptr);
  {
    Port_DebugCapture debug;
    auto library = Host::SourceLibrary::Create("work");
    EXPECT_EQ(admin->InitializeAfterCreate(nullptr, library.Get()), CitI::kInvalidArg);
    EXPECT_EQ(debug.text(),
              "ERROR: HdlFile::InitializeAfterCreate - Invalid context parameter: expected IFileType.\n");
  }
  EXPECT_FALSE(FileObject(file.Get())->GetFileType());
  auto fileType = Host::FileType::Create("Verilog", {"v"});
  EXPECT_EQ(admin->InitializeAfterCreate(nullptr, fileType.Get()), CitI::kOk);
  EXPECT_EQ(FileObject(file.Get())->GetFileType().Get(), fileType.Get());
  EXPECT_EQ(admin->Reserved3(), CitI::kNotImpl);
  EXPECT_EQ(admin->Reserved4(), CitI::kNotImpl);
  EXPECT_EQ(admin->Reserved5(), CitI::kNotImpl);
}

TEST_F(HdlFile, HostComponentsAreKeptWithOneReferenceAndHandedOutWithAnother) {
  auto file = NewBareFile();
  auto* reference = Prjrep::QueryAs<Vad::IFileCompReference>(file.Get());
  auto component = Host::FileComponent::Create("/x/top.v");
  EXPECT_EQ(reference->setFileComponent(component.Get()), CitI::kOk);
  EXPECT_EQ(Prjrep::RefCountOf(component.Get()), 2u);
  EXPECT_EQ(reference->getFileComponent(nullptr), CitI::kOk);
  {
    Prjrep::AutoPtr<Vad::IFile> held;
    EXPECT_EQ(reference->getFileComponent(held.Out()), CitI::kOk);
    EXPECT_EQ(held.Get(), component.Get());
    EXPECT_EQ(Prjrep::RefCountOf(component.Get()), 3u);
  }
  // Something that is no file component is stored as nothing.
  EXPECT_EQ(reference->setFileComponent(Host::SourceLibrary::Create("work").Get()), CitI::kOk);
  EXPECT_EQ(Prjrep::RefCountOf(component.Get()), 1u);

  auto* member = Prjrep::QueryAs<Vad::ISourceLibraryMember>(file.Get());
  EXPECT_EQ(member->getSourceLibrary(nullptr), CitI::kInvalidArg);
  Prjrep::AutoPtr<Vad::ISourceLibrary> library;
  EXPECT_EQ(member->getSourceLibrary(library.Out()), CitI::kOk);
  EXPECT_FALSE(library);
  SetLibrary(file.Get(), "ip");
  EXPECT_EQ(member->getSourceLibrary(library.Out()), CitI::kOk);
  Port::StringBase name;
  library->GetName(&name);
  EXPECT_EQ(name, "ip");
}

TEST_F(HdlFile, ANewFileIsOutOfDateUntilItsFirstSuccessfulParse) {
  auto file = AddNewFile(project_.Get(), "/proj/notes.txt", "PLUGIN_General");
  EXPECT_FALSE(UpToDate(file.Get()));
  // Nothing is parsed until asked.
  Prjrep::AutoRelease<Vad::IHdlDesignUnitIterator> units;
  ASSERT_EQ(file->getDesignUnits(nullptr, units.Out()), CitI::kOk);
  EXPECT_TRUE(units->IsDone());

  EXPECT_EQ(file->parseIfNeeded(), CitI::kOk);
  EXPECT_TRUE(UpToDate(file.Get()));
  bool needsParse = true;
  file->getNeedsParse(&needsParse);
  EXPECT_FALSE(needsParse);
  ASSERT_EQ(units->First(), CitI::kOk);
  ASSERT_FALSE(units->IsDone());
  EXPECT_EQ(StoreKeyOf(units->Current()), "|Generic||notes.txt");
  std::uint32_t count = 0;
  EXPECT_EQ(FileObject(file.Get())->getDesignUnitCount(&count), CitI::kOk);
  EXPECT_EQ(count, 1u);
}

TEST_F(HdlFile, MarkingAnUpToDateFileMakesTheNextRequestParseAgain) {
  auto file = AddNewFile(project_.Get(), "/proj/notes.txt", "PLUGIN_General");
  ASSERT_EQ(file->parseIfNeeded(), CitI::kOk);
  Prjrep::AutoPtr<CitI::IInterface> first(OnlyUnit(file.Get()));
  ASSERT_TRUE(first);
  ASSERT_EQ(file->parseIfNeeded(), CitI::kOk);
  EXPECT_EQ(OnlyUnit(file.Get()), first.Get());  // up to date: not parsed again

  file->setNeedsParse(true);
  Port::StringBase text = "old";
  EXPECT_EQ(file->getResultText(&text), CitI::kOk);
  EXPECT_EQ(text, "");
  EXPECT_NE(OnlyUnit(file.Get()), first.Get());
  bool needsParse = true;
  file->getNeedsParse(&needsParse);
  EXPECT_FALSE(needsParse);
  EXPECT_EQ(file->getResultText(nullptr), CitI::kInvalidArg);
}

TEST_F(HdlFile, AFileOutsideAProjectParsesEveryTimeItIsAsked) {
  auto file = NewFile(project_.Get(), "/proj/loose.txt", "PLUGIN_General");
  ASSERT_EQ(file->parseIfNeeded(), CitI::kOk);
  Prjrep::AutoPtr<CitI::IInterface> first(OnlyUnit(file.Get()));
  // Without a configuration the holder cannot vouch for its last parse.
  EXPECT_FALSE(UpToDate(file.Get()));
  ASSERT_EQ(file->parseIfNeeded(), CitI::kOk);
  EXPECT_NE(OnlyUnit(file.Get()), first.Get());
}

TEST_F(HdlFile, KnowsItsProjectOnlyWhileItIsInIt) {
  auto file = NewFile(project_.Get(), "/proj/a.txt", "PLUGIN_General");
  Prjrep::AutoPtr<Vad::IHdlProject> owner;
  EXPECT_EQ(file->getProject(owner.Out()), CitI::kOk);
  EXPECT_FALSE(owner);
  EXPECT_EQ(file->getProject(nullptr), CitI::kInvalidArg);

  FileSetOf(project_.Get())->Add(file.Get());
  EXPECT_EQ(file->getProject(owner.Out()), CitI::kOk);
  EXPECT_EQ(owner.Get(), project_.Get());
  owner = nullptr;

  // The project goes while the host still holds the file: the file's link must not dangle.
  project_ = nullptr;
  EXPECT_EQ(file->getProject(owner.Out()), CitI::kOk);
  EXPECT_FALSE(owner);
  EXPECT_EQ(file->parseIfNeeded(), CitI::kOk);
}

TEST_F(HdlFile, UnitsKeptAfterTheFileIsGoneNoLongerPointToIt) {
  auto file = AddNewFile(project_.Get(), "/proj/a.txt", "PLUGIN_General");
  ASSERT_EQ(file->parseIfNeeded(), CitI::kOk);
  Prjrep::AutoPtr<CitI::IInterface> unit(OnlyUnit(file.Get()));
  auto* element = Prjrep::ImplementationCast<Vad::CHdlElement>(unit.Get());
  ASSERT_NE(element, nullptr);
  project_ = nullptr;
  file = nullptr;
  Prjrep::AutoRelease<CitI::IInterface> link;
  EXPECT_EQ(element->GetFileObject(link.Out()), CitI::kOk);
  EXPECT_FALSE(link);
}

}  // namespace
