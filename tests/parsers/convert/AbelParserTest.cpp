#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "ConvertTestFixture.h"

using convert_test::ConverterParse;
using testing::ElementsAre;
using testing::IsEmpty;

namespace {

class AbelParse : public ConverterParse {
 protected:
  // An ABEL converter that logs its runs and writes `output` as "<base name>.hrf" in the current
  // directory.
  void InstallAbelConverter(std::string_view output) {
    WriteBytes(tools_.Path("abel.out"), output);
    InstallTool("abelconv", LogRun("abelconv") + "cp '" + tools_.Path("abel.out") + "' \"${1%.*}.hrf\"\n");
  }
};

TEST_F(AbelParse, ConverterRunsInTheSourceDirectoryAndItsOutputIsReadWithTheHoldersSlots) {
  InstallAbelConverter("MODULE top 3\nSUBMODULE and2 4\n");
  std::string path = Source("counter.abl", "module counter\n");

  EXPECT_THAT(Parse(path, "PLUGIN_Abel"),
              ElementsAre("|ComponentInstantiation||top|top|and2|and2| line 4 instance parent |Module||top",
                          "|Module||top line 3 module flag"));
  EXPECT_EQ(ToolLog("abelconv"), sources_.path() + "|counter.abl|-ohrf|only\n");
  EXPECT_THAT(Messages(), IsEmpty());
}

TEST_F(AbelParse, VectorOutputRecordsTestVectorsButNoModuleOrArchitecture) {
  InstallAbelConverter("MODULE top\nMODULE ent arch 7\nTEST_VECTORS top\n");
  std::string path = Source("vectors.abv", "test_vectors\n");

  std::vector<std::string> units = Parse(path, "PLUGIN_AbelVector");
  EXPECT_THAT(units, testing::Contains("|Module||top line 0 test-vector"));
  EXPECT_THAT(units,
              testing::Contains(
                  "|ComponentInstantiation||top_TestVector|top_TestVector|top|top| line 0 instance parent "
                  "|Module||top"));
  for (const std::string& unit : units) {
    EXPECT_THAT(unit, testing::Not(testing::HasSubstr(" module"))) << unit;
    EXPECT_THAT(unit, testing::Not(testing::HasSubstr("architecture"))) << unit;
  }

  // The plain ABEL parser reading the same output records the module lines.
  file_ = AddNewFile(project_.Get(), Source("plain.abl", ""), "PLUGIN_Abel");
  EXPECT_THAT(ParseAgain(), testing::Contains("|Module||top line 0 module flag"));
}

TEST_F(AbelParse, FailingConverterIsReportedAndAnEarlierOutputIsStillRead) {
  InstallTool("abelconv", LogRun("abelconv") + "exit 1\n");
  std::string path = Source("stale.abl", "");
  Source("stale.hrf", "MODULE earlier 2\n");

  EXPECT_THAT(Parse(path, "PLUGIN_Abel"), ElementsAre("|Module||earlier line 2 module flag"));
  EXPECT_THAT(Messages(), ElementsAre("error: Unable to run abelconv - Process Failed\n"));
  EXPECT_EQ(ToolLog("abelconv"), sources_.path() + "|stale.abl|-ohrf|only\n");
}

TEST_F(AbelParse, ConverterWithAnyOtherFailureOrMissingIsABadCommandLineAndMissingOutputIsSaid) {
  std::string path = Source("lost.abl", "");
  testing::internal::CaptureStdout();
  EXPECT_THAT(Parse(path, "PLUGIN_Abel"), IsEmpty());
  EXPECT_EQ(testing::internal::GetCapturedStdout(), "ERROR: Quillon.dll: HrfParser: File not found\n");

  InstallTool("abelconv", "exit 3\n");
  testing::internal::CaptureStdout();
  EXPECT_THAT(ParseAgain(), IsEmpty());
  testing::internal::GetCapturedStdout();

  EXPECT_THAT(Messages(), ElementsAre("error: Unable to run abelconv - Bad Command Line\n",
                                      "error: Unable to run abelconv - Bad Command Line\n"));
}

}  // namespace
