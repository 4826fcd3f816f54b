#include <gtest/gtest.h>
#include <stdlib.h>

#include <filesystem>
#include <fstream>
#include <string>

#include "Port/Env.h"
#include "ScopedEnv.h"
#include "ScopedTempDir.h"

namespace fs = std::filesystem;

namespace {

// A fresh directory tree: <root>/data/kestrel/arch.vho and <root>/other/cells.vho.
class DataDir : public testing::Test {
 protected:
  void SetUp() override {
    fs::create_directories(Under("data/kestrel"));
    fs::create_directories(Under("other"));
    std::ofstream(Under("data/kestrel/arch.vho")) << "-- cells\n";
    std::ofstream(Under("other/cells.vho")) << "-- cells\n";
  }

  std::string Under(const char* relative) const { return root_.Path(relative); }

  ScopedTempDir root_;
  ScopedEnv dataDir_{"QUILLON_DATA_DIR", Under("data").c_str()};
};

}  // namespace

TEST(PortEnv, GetEnvSeesSetAndUnsetAndBadNamesAreRefused) {
  ScopedEnv clean("QUILLON_TEST_VARIABLE", nullptr);
  EXPECT_EQ(Port_Env::GetEnv("QUILLON_TEST_VARIABLE"), nullptr);
  ASSERT_TRUE(Port_Env::SetEnv("QUILLON_TEST_VARIABLE", "a value"));
  EXPECT_STREQ(Port_Env::GetEnv("QUILLON_TEST_VARIABLE"), "a value");
  ASSERT_TRUE(Port_Env::SetEnv("QUILLON_TEST_VARIABLE", ""));
  EXPECT_STREQ(Port_Env::GetEnv("QUILLON_TEST_VARIABLE"), "");
  ASSERT_TRUE(Port_Env::UnsetEnv("QUILLON_TEST_VARIABLE"));
  EXPECT_EQ(Port_Env::GetEnv("QUILLON_TEST_VARIABLE"), nullptr);
  EXPECT_TRUE(Port_Env::UnsetEnv("QUILLON_TEST_VARIABLE"));
  EXPECT_EQ(Port_Env::GetEnv(nullptr), nullptr);
  EXPECT_EQ(Port_Env::GetEnv(""), nullptr);
  EXPECT_FALSE(Port_Env::SetEnv(nullptr, "x"));
  EXPECT_FALSE(Port_Env::SetEnv("", "x"));
  EXPECT_FALSE(Port_Env::SetEnv("A=B", "x"));
  EXPECT_FALSE(Port_Env::SetEnv("QUILLON_TEST_VARIABLE", nullptr));
  EXPECT_FALSE(Port_Env::UnsetEnv("A=B"));
  EXPECT_FALSE(Port_Env::UnsetEnv(nullptr));
}

TEST(PortEnv, DataDirFallsBackToTheBuiltInFolder) {
  ScopedEnv unset("QUILLON_DATA_DIR", nullptr);
  Port::StringBase builtIn = Port_Env::GetDataDir();
  EXPECT_TRUE(builtIn.EndsWith("/data/share")) << builtIn.str();
  EXPECT_TRUE(Port_Env::GetInstallRoot().EndsWith("/data")) << Port_Env::GetInstallRoot().str();
  ScopedEnv empty("QUILLON_DATA_DIR", "");
  EXPECT_EQ(Port_Env::GetDataDir(), builtIn);
}

TEST_F(DataDir, FindsAnExistingDataFile) {
  Port::StringBase path("stale");
  EXPECT_TRUE(Port_Env::GetDataFileName("kestrel/arch.vho", 1, &path));
  EXPECT_EQ(path, Under("data/kestrel/arch.vho"));
  EXPECT_TRUE(Port_Env::GetDataFileName("../other/cells.vho", 1, &path));
  EXPECT_EQ(path, Under("other/cells.vho"));
  EXPECT_TRUE(Port_Env::GetDataFileName("kestrel/arch.vho", 1, nullptr));
}

TEST_F(DataDir, MissingFileOrNameFailsOnlyWhenItMustExist) {
  Port::StringBase path;
  EXPECT_FALSE(Port_Env::GetDataFileName("falcon/arch.vho", 1, &path));
  EXPECT_EQ(path, Under("data/falcon/arch.vho"));
  EXPECT_FALSE(Port_Env::GetDataFileName("kestrel", 1, &path)) << "a folder is not a data file";
  EXPECT_TRUE(Port_Env::GetDataFileName("falcon/arch.vho", 0, &path));
  EXPECT_EQ(path, Under("data/falcon/arch.vho"));
}

TEST_F(DataDir, ExpandsEnvironmentReferencesAndRefusesEmptyNames) {
  ScopedEnv cells("QUILLON_TEST_CELLS", root_.path().c_str());
  ScopedEnv unset("QUILLON_TEST_UNSET", nullptr);
  Port::StringBase path;
  EXPECT_TRUE(Port_Env::GetDataFileName("$QUILLON_TEST_CELLS/other/cells.vho", 1, &path));
  EXPECT_EQ(path, Under("other/cells.vho"));
  EXPECT_TRUE(Port_Env::GetDataFileName("${QUILLON_TEST_CELLS}/data/kestrel/arch.vho", 1, &path));
  EXPECT_EQ(path, Under("data/kestrel/arch.vho"));
  EXPECT_FALSE(Port_Env::GetDataFileName("$QUILLON_TEST_UNSET/other/cells.vho", 1, &path));
  EXPECT_EQ(path, Under("data/$QUILLON_TEST_UNSET/other/cells.vho"));
  EXPECT_FALSE(Port_Env::GetDataFileName("${QUILLON_TEST_CELLS/other/cells.vho", 1, &path));

  path = "stale";
  EXPECT_FALSE(Port_Env::GetDataFileName("", 0, &path));
  EXPECT_TRUE(path.IsEmpty());
  path = "stale";
  EXPECT_FALSE(Port_Env::GetDataFileName(nullptr, 1, &path));
  EXPECT_TRUE(path.IsEmpty());
}
