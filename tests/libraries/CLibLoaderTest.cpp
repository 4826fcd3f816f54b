#include <gtest/gtest.h>

#include <filesystem>
#include <string>
#include <vector>

#include "CBasecellLoader.h"
#include "CBlockcellLoader.h"
#include "CLibRefs.h"
#include "CTimecellLoader.h"
#include "ScopedTempDir.h"
#include "TestHost.h"

using namespace test_host;

namespace {

bool IsCell(const Vad::CLibRefs& references, std::string_view library, std::string_view name) {
  return references.HasLibraryUnit(library, "vcomponents", "all", name, "VHDL");
}

std::vector<std::string> Entries(const std::string& dir) {
  std::vector<std::string> names;
  for (const auto& entry : std::filesystem::directory_iterator(dir)) names.push_back(entry.path().filename());
  return names;
}

std::string Platform() { return Port_Env::GetPlatformPath(); }

// "<name>=$CORVANE/<folder>/<name>" for each name, one a line.
std::string Mappings(const std::string& folder, std::initializer_list<const char*> names) {
  std::string text;
  for (const char* name : names) text += std::string(name) + "=$CORVANE/" + folder + "/" + name + "\n";
  return text;
}

TEST(MappingFiles, TheTimingLibraryIsReadThroughTheSimulationMappingUnderTheFixedFolder) {
  Vad::CTimecellLoader loader;
  EXPECT_STREQ(loader.MappingFileName(), "corvanesim.ini");
  const std::string expected =
      Mappings("vhdl/hdp/nt", {"std", "ieee", "synopsys", "timecell", "basecell", "qlprim", "qlmacro", "qlio",
                               "corvanecorelib"}) +
      Mappings("verilog/hdp/nt", {"timecell_ver", "basecell_ver", "qlprim_ver", "qlmacro_ver", "qlio_ver"});
  EXPECT_EQ(loader.MappingText(), expected);

  ScopedCellLibraries corvane;
  loader.SetFamily("lumen");  // lumen ships a timing test file but no library of its own
  EXPECT_EQ(loader.LibraryDirectory(), "$CORVANE/vhdl/hdp/" + Platform() + "/timecell");
  EXPECT_EQ(loader.MappingText(), expected);
}

// The unified library maps the family's directory, or the default one for a family without a test
// file; the macro library maps its own directory and the default unified library.
TEST(MappingFiles, TheSynthesisLibrariesMapTheFamilysDirectoryOrTheDefaultOne) {
  const std::string head = Mappings("vhdl/syn", {"std", "ieee"});
  const std::string tail = Mappings("vhdl/syn", {"qlprim", "qlmacro", "qlio"}) +
                           Mappings("verilog/syn", {"basecell_ver", "blockcell_ver"});
  const std::string basecell = "basecell=$CORVANE/vhdl/syn/basecell\n";
  Vad::CBasecellLoader unified;
  EXPECT_STREQ(unified.MappingFileName(), "chdp.ini");
  EXPECT_EQ(unified.MappingText(), head + basecell + tail);
  unified.SetFamily("lumen");
  EXPECT_EQ(unified.LibraryDirectory(), "$CORVANE/lumen/vhdl/syn/basecell");
  EXPECT_EQ(unified.MappingText(), head + "basecell=$CORVANE/lumen/vhdl/syn/basecell\n" + tail);
  unified.SetFamily("kestrel");
  EXPECT_EQ(unified.LibraryDirectory(), "");
  EXPECT_EQ(unified.MappingText(), head + basecell + tail);

  Vad::CBlockcellLoader macros;
  EXPECT_STREQ(macros.MappingFileName(), "chdp.ini");
  EXPECT_EQ(macros.MappingText(), head + "blockcell=$CORVANE/vhdl/syn/blockcell\n" + basecell + tail);
  macros.SetFamily("lumen");
  EXPECT_EQ(macros.MappingText(), head + "blockcell=$CORVANE/lumen/vhdl/syn/blockcell\n" + basecell + tail);
}

// Each test loads from a working directory of its own, with temporary directories made in a
// folder of its own, so that anything left behind shows.
class Loading : public testing::Test {
 protected:
  ScopedTempDir work_;
  ScopedTempDir temporaries_;
  ScopedWorkingDirectory inWork_{work_.path()};
  ScopedEnv tmpdir_{"TMPDIR", temporaries_.path().c_str()};
};

TEST_F(Loading, ALoadRestoresTheWorkingDirectoryAndRemovesItsTemporaryDirectory) {
  ScopedCellLibraries corvane;
  Vad::CLibRefs references;  // three loads
  Vad::CBasecellLoader loader;
  EXPECT_TRUE(loader.Load(&references));
  EXPECT_TRUE(IsCell(references, "basecell", "QL_DFF"));
  EXPECT_EQ(CurrentDirectory(), work_.path());
  EXPECT_TRUE(Entries(work_.path()).empty());  // the mapping file was written elsewhere
  EXPECT_TRUE(Entries(temporaries_.path()).empty());
}

TEST_F(Loading, ALibraryThatCannotBeLoadedContributesNothingAndLeavesNothingBehind) {
  Vad::CLibRefs references;
  references.AddLibraryUnit("blockcell", "vcomponents", "STALE_CELL");
  {
    ScopedEnv noCellLibraries("CORVANE", nullptr);
    Vad::CBlockcellLoader loader;
    EXPECT_FALSE(loader.Load(&references));
  }
  {
    ScopedTempDir empty;
    ScopedEnv emptyCellLibraries("CORVANE", empty.path().c_str());
    Vad::CTimecellLoader loader;
    EXPECT_FALSE(loader.Load(&references));
  }
  EXPECT_FALSE(IsCell(references, "blockcell", "STALE_CELL"));
  EXPECT_FALSE(IsCell(references, "timecell", "QT_FF"));
  EXPECT_EQ(CurrentDirectory(), work_.path());
  EXPECT_TRUE(Entries(work_.path()).empty());
  EXPECT_TRUE(Entries(temporaries_.path()).empty());
  EXPECT_FALSE(Vad::CBasecellLoader().Load(nullptr));
}

TEST_F(Loading, AFamilyChangeReloadsALoaderThatHasReferencesAlready) {
  ScopedCellLibraries corvane;
  Vad::CLibRefs references;
  references.RemoveLibrary("blockcell");
  Vad::CBlockcellLoader loader;
  loader.SetFamily("lumen");  // no references yet: nothing is loaded
  EXPECT_FALSE(IsCell(references, "blockcell", "LM_RAM9K"));
  EXPECT_TRUE(loader.Load(&references));
  EXPECT_TRUE(IsCell(references, "blockcell", "LM_RAM9K"));
  loader.SetFamily("kestrel");
  EXPECT_TRUE(IsCell(references, "blockcell", "QB_RAM4K"));
  EXPECT_FALSE(IsCell(references, "blockcell", "LM_RAM9K"));
}

TEST_F(Loading, TheMessageManagersComeBackInTheirEarlierStates) {
  Port_MsgCollector enabled, disabled;
  Port_MsgDispatcher::addMsgMan(&enabled);
  Port_MsgDispatcher::addMsgMan(&disabled);
  disabled.disable();
  Port_MsgManDefault* standard = Port_MsgDispatcher::getDefaultMsgMan();
  standard->disable();
  {
    ScopedCellLibraries corvane;
    Vad::CLibRefs references;
    EXPECT_TRUE(Vad::CTimecellLoader().Load(&references));
    ScopedEnv noCellLibraries("CORVANE", nullptr);
    EXPECT_FALSE(Vad::CTimecellLoader().Load(&references));
  }
  EXPECT_TRUE(Port_MsgDispatcher::isRegistered(&enabled));
  EXPECT_TRUE(Port_MsgDispatcher::isRegistered(&disabled));
  EXPECT_TRUE(Port_MsgDispatcher::isRegistered(standard));
  EXPECT_TRUE(enabled.isEnabled());
  EXPECT_FALSE(disabled.isEnabled());
  EXPECT_TRUE(standard->isEnabled());
  std::vector<Port_MsgMan*> managers;
  Port_MsgDispatcher::getAllMsgMans(managers);
  EXPECT_EQ(managers.size(), 3u);  // no capture left registered
  Port_MsgDispatcher::removeMsgMan(&enabled);
  Port_MsgDispatcher::removeMsgMan(&disabled);
}

}  // namespace
