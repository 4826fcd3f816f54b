#include <gtest/gtest.h>

#include "Arch.h"
#include "EntityDecl.h"
#include "IDesignUnit.h"
#include "IDesignUnitType.h"
#include "TestHost.h"

using namespace test_host;

namespace {

const Port::XUID kEntityType{std::string_view("{0CBD7350-BC55-49c4-84AD-BBF6684DF5A8}")};

// The look-ups of a design unit that go through its source file, its holder and its project.
class DesignUnitLookup : public PipelineTest {
 protected:
  void SetUp() override { project_ = NewProject(); }

  // A file whose last parse recorded `entity` and `architecture` of it, as a parser would.
  Prjrep::AutoPtr<Vad::IHdlFile> RecordedFile(Vad::IHdlProject* project, std::string_view path, bool portFlag,
                                              std::string_view entity = "counter") {
    auto file = AddNewFile(project, path, "PLUGIN_Vhdl");
    Vad::CParserConfigHolder* holder = HolderOf(file.Get());
    holder->BeginParse(nullptr);
    holder->AddEntityDecl(Port::StringBase(entity), 1, portFlag, kEntityType);
    holder->AddArch("rtl", Port::StringBase(entity), 5, kEntityType);
    holder->EndParse();
    file->setNeedsParse(false);
    return file;
  }

  static Vad::CHdlElement* UnitOfKind(Vad::IHdlFile* file, std::uint32_t type) {
    for (CitI::IInterface* unit : UnitsOf(FileObject(file)->GetUnitSet())) {
      auto* element = Prjrep::ImplementationCast<Vad::CHdlElement>(unit);
      if (element && element->GetType() == type) return element;
    }
    return nullptr;
  }

  Prjrep::AutoPtr<Vad::IHdlProject> project_;
};

TEST_F(DesignUnitLookup, AnArchitectureReportsTheFlagOfItsEntityInTheSameFile) {
  auto file = RecordedFile(project_.Get(), "/p/counter.vhd", true);
  Vad::CHdlElement* architecture = UnitOfKind(file.Get(), Vad::DbType::kArchitecture);
  ASSERT_NE(architecture, nullptr);
  bool flag = false;
  EXPECT_EQ(Prjrep::QueryAs<Vad::IHdlDesignUnit>(architecture)->GetUnitFlag(0, &flag), CitI::kOk);
  EXPECT_TRUE(flag);
  Vad::CHdlElement* entity = nullptr;
  EXPECT_EQ(architecture->FindEntity(0, dynamic_cast<Vad::Arch*>(architecture), &entity), CitI::kOk);
  EXPECT_EQ(entity, UnitOfKind(file.Get(), Vad::DbType::kEntity));

  auto orphan = AddNewFile(project_.Get(), "/p/orphan.vhd", "PLUGIN_Vhdl");
  Vad::CParserConfigHolder* holder = HolderOf(orphan.Get());
  holder->BeginParse(nullptr);
  holder->AddArch("rtl", "missing", 1, kEntityType);
  holder->EndParse();
  Vad::CHdlElement* lonely = UnitOfKind(orphan.Get(), Vad::DbType::kArchitecture);
  EXPECT_EQ(Prjrep::QueryAs<Vad::IHdlDesignUnit>(lonely)->GetUnitFlag(0, &flag), 2);
}

TEST_F(DesignUnitLookup, UnitsReachTheHostsDesignUnitTypeOfTheirFileType) {
  auto file = RecordedFile(project_.Get(), "/p/counter.vhd", false);
  Vad::CHdlElement* entity = UnitOfKind(file.Get(), Vad::DbType::kEntity);
  Prjrep::AutoRelease<Vad::IDesignUnitType> type;
  ASSERT_EQ(Prjrep::QueryAs<Vad::IDesignUnit>(entity)->GetDesignUnitType(type.Out()), CitI::kOk);
  ASSERT_TRUE(type);
  Port::StringBase fileTypeName;
  type->GetFileTypeName(&fileTypeName);
  EXPECT_EQ(fileTypeName, "HDL");
  Port::XUID typeId;
  type->GetTypeId(&typeId);
  EXPECT_EQ(typeId, kEntityType);
}

TEST_F(DesignUnitLookup, TheSameUnitIsOneOfTheSameKindKeyLibraryAndFullFileName) {
  auto project2 = NewProject();
  auto file = RecordedFile(project_.Get(), "/p/counter.vhd", false);
  auto copy = RecordedFile(project2.Get(), "/p/counter.vhd", false);
  auto elsewhere = RecordedFile(project2.Get(), "/q/counter.vhd", false);
  Vad::CHdlElement* entity = UnitOfKind(file.Get(), Vad::DbType::kEntity);
  EXPECT_TRUE(entity->IsSameDesignUnit(UnitOfKind(copy.Get(), Vad::DbType::kEntity)));
  EXPECT_FALSE(entity->IsSameDesignUnit(UnitOfKind(elsewhere.Get(), Vad::DbType::kEntity)));
  EXPECT_FALSE(entity->IsSameDesignUnit(UnitOfKind(copy.Get(), Vad::DbType::kArchitecture)));
  SetLibrary(copy.Get(), "other");
  EXPECT_FALSE(entity->IsSameDesignUnit(UnitOfKind(copy.Get(), Vad::DbType::kEntity)));
}

}  // namespace
