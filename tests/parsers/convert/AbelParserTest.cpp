#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <signal.h>
#include <unistd.h>

#include <sstream>
#include <string>
#include <vector>

#include "ConvertTestFixture.h"
#include "Port/InputLimits.h"

using convert_test::ConverterParse;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

namespace {

class AbelParse : public ConverterParse {
 protected:
  // Every process whose id is a line of `pidFile` has ended (a killed process may take a moment
  // to be reaped by its new parent).
  static void ExpectAllEnded(const std::string& pidFile) {
    std::istringstream lines(ReadBytes(pidFile));
    int checked = 0;
    for (std::string line; std::getline(lines, line); ++checked) {
      const pid_t pid = static_cast<pid_t>(std::stol(line));
      bool ended = false;
      for (int attempt = 0; attempt < 200 && !ended; ++attempt) {
        ended = kill(pid, 0) != 0 || IsZombie(pid);
        if (!ended) usleep(10000);
      }
      EXPECT_TRUE(ended) << "process " << pid << " still runs";
    }
    EXPECT_GT(checked, 0);
  }
  static bool IsZombie(pid_t pid) {
    std::string status = ReadBytes("/proc/" + std::to_string(pid) + "/stat");
    std::size_t close = status.rfind(')');
    return close != std::string::npos && close + 2 < status.size() && status[close + 2] == 'Z';
  }

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
  EXPECT_THAT(Messages(), ElementsAre("error: Unable to run abelconv - Process Failed (" + path +
                                      ": abelconv exited with status 1)\n"));
  EXPECT_EQ(ToolLog("abelconv"), sources_.path() + "|stale.abl|-ohrf|only\n");
}

TEST_F(AbelParse, FailedConverterDoesNotLeaveAnOutputOlderThanItsSourceToBeRead) {
  InstallTool("abelconv", "exit 1\n");
  std::string path = Source("aged.abl", "");
  SetAge(Source("aged.hrf", "MODULE outdated 2\n"), -3600);

  EXPECT_THAT(Parse(path, "PLUGIN_Abel"), IsEmpty());
  EXPECT_THAT(Messages(),
              ElementsAre(HasSubstr("exited with status 1"),
                          "warning: aged.hrf is older than aged.abl and is not read, as abelconv failed\n"));
}

TEST_F(AbelParse, EveryFailureNamesTheConverterTheFileAndWhatHappenedAndMissingOutputIsAnError) {
  std::string path = Source("lost.abl", "");
  testing::internal::CaptureStdout();
  EXPECT_THAT(Parse(path, "PLUGIN_Abel"), IsEmpty());
  InstallTool("abelconv", "exit 3\n");
  EXPECT_THAT(ParseAgain(), IsEmpty());
  InstallTool("abelconv", "kill -KILL $$\n");
  EXPECT_THAT(ParseAgain(), IsEmpty());
  InstallTool("abelconv", "exit 255\n");
  EXPECT_THAT(ParseAgain(), IsEmpty());
  InstallTool("abelconv", "exit 0\n");
  EXPECT_THAT(ParseAgain(), IsEmpty());
  EXPECT_EQ(testing::internal::GetCapturedStdout(), "") << "nothing but the answer goes to standard output";

  const std::string noOutput = "error: abelconv wrote no output lost.hrf for lost.abl\n";
  const std::string failed = "error: Unable to run abelconv - Bad Command Line (" + path + ": abelconv ";
  EXPECT_THAT(Messages(),
              ElementsAre(failed + "could not be started (not found or not executable))\n", noOutput,
                          failed + "exited with status 3)\n", noOutput, failed + "was ended by signal 9)\n",
                          noOutput, failed + "exited with status 255)\n", noOutput, noOutput));
}

TEST_F(AbelParse, ConverterArgumentsAreTheFileNameAsItIsWhateverItHolds) {
  InstallAbelConverter("MODULE odd 1\n");
  const std::string name = "a \"b\" 'c' $(d) `e` ;f|g&h<i>j\\k *?[l] #m.abl";
  EXPECT_THAT(Parse(Source(name, ""), "PLUGIN_Abel"), ElementsAre("|Module||odd line 1 module flag"));
  EXPECT_EQ(ToolLog("abelconv"), sources_.path() + "|" + name + "|-ohrf|only\n");
  EXPECT_THAT(Messages(), IsEmpty());
}

TEST_F(AbelParse, ConverterThatOverrunsItsTimeLimitIsStoppedWithEverythingItStarted) {
  const std::string pids = tools_.Path("pids");
  SetProperty(project_.Get(), Port::InputLimits::kConverterTimeoutProperty, "1");
  // The converter and a child of its own both hold the output pipe open.
  InstallTool("abelconv", "sleep 600 &\necho $! > '" + pids + "'\necho $$ >> '" + pids + "'\nsleep 600\n");
  std::string path = Source("slow.abl", "");

  EXPECT_THAT(Parse(path, "PLUGIN_Abel"), IsEmpty());
  EXPECT_THAT(Messages(), ElementsAre("error: Unable to run abelconv - Bad Command Line (" + path +
                                          ": abelconv did not finish within 1 seconds and was stopped)\n",
                                      "error: abelconv wrote no output slow.hrf for slow.abl\n"));
  ExpectAllEnded(pids);
}

TEST_F(AbelParse, ChildLeftBehindByAFinishedConverterDoesNotKeepTheParseWaiting) {
  const std::string pids = tools_.Path("pids");
  InstallAbelConverter("MODULE quick 1\n");
  InstallTool("abelconv", "sleep 600 &\necho $! > '" + pids + "'\ncp '" + tools_.Path("abel.out") +
                              "' \"${1%.*}.hrf\"\n");
  EXPECT_THAT(Parse(Source("quick.abl", ""), "PLUGIN_Abel"),
              ElementsAre("|Module||quick line 1 module flag"));
  EXPECT_THAT(Messages(), IsEmpty());
  ExpectAllEnded(pids);
}

}  // namespace
