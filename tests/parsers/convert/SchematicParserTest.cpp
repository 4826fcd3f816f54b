#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "ConvertTestFixture.h"
#include "Host/FileComponent.h"
#include "IFileCompReference.h"

using convert_test::ConverterParse;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

namespace {

constexpr const char* kNoFamilyWarning =
    "WARNING: Device property not set for schematic parser. Using \"kestrel\" to generate netlist.\n";

class SchematicParse : public ConverterParse {
 protected:
  // A schematic converter named `name` that logs its runs and writes one module named after its
  // family into the output path it is given.
  void InstallSchematicConverter(std::string_view name = "drawconv") {
    InstallTool(name, LogRun(name) + "printf 'MODULE %s 1\\nSUBMODULE gate 2\\n' \"$4\" > \"$6\"\n");
  }
};

TEST_F(SchematicParse, WithoutAFamilyTheConverterGetsKestrelAndTheWarningIsIssued) {
  InstallSchematicConverter();
  std::string path = Source("sheet.sch", "");
  const std::string output = sources_.Path("sheet.hrf");

  EXPECT_THAT(Parse(path, "PLUGIN_Schematic"),
              ElementsAre("|ComponentInstantiation||kestrel|kestrel|gate|gate| line 2 instance parent "
                          "|Module||kestrel",
                          "|Module||kestrel line 1 file-named flag"));
  EXPECT_THAT(ToolLog("drawconv"),
              testing::EndsWith("|-intstyle|ardent|-family|kestrel|" + path + "|" + output + "\n"));
  EXPECT_THAT(debugText_, HasSubstr(kNoFamilyWarning));
  EXPECT_THAT(debugText_, HasSubstr("Cmd line is: drawconv -intstyle ardent -family kestrel \"" + path +
                                    "\" \"" + output + "\"\n"));
  EXPECT_THAT(debugText_, HasSubstr("Extracting hierarchy info from: " + path + "\n"));

  SetProperty(project_.Get(), "PROP_DevFamilyPMName", "k200");
  file_ = AddNewFile(project_.Get(), Source("other.sch", ""), "PLUGIN_Schematic");
  EXPECT_THAT(ParseAgain(), testing::Contains("|Module||k200 line 1 file-named flag"));
  EXPECT_THAT(debugText_, testing::Not(HasSubstr(kNoFamilyWarning)));
  EXPECT_THAT(Messages(), IsEmpty());
}

TEST_F(SchematicParse, OutputNewerThanTheSourceIsReadWithoutConvertingAgainAndAnOlderOneIsRedone) {
  InstallSchematicConverter();
  std::string path = Source("sheet.sch", "");
  std::string output = Source("sheet.hrf", "MODULE kept 5\n");
  SetAge(output, 100);

  EXPECT_THAT(Parse(path, "PLUGIN_Schematic"), ElementsAre("|Module||kept line 5 file-named flag"));
  EXPECT_EQ(ToolLog("drawconv"), "");

  SetAge(output, -100);
  EXPECT_THAT(ParseAgain(), testing::Contains("|Module||kestrel line 1 file-named flag"));
  EXPECT_THAT(ToolLog("drawconv"), HasSubstr("/sheet.hrf\n"));
}

TEST_F(SchematicParse, SecondConverterIsChosenByTheEnvironmentVariable) {
  InstallSchematicConverter("drawconv3");
  ScopedEnv qt3("CVN_WSMGR_QT3", "1");

  EXPECT_THAT(Parse(Source("sheet.sch", ""), "PLUGIN_Schematic"),
              testing::Contains("|Module||kestrel line 1 file-named flag"));
  EXPECT_THAT(ToolLog("drawconv3"), HasSubstr("|-family|kestrel|"));
  EXPECT_THAT(debugText_, HasSubstr("Cmd line is: drawconv3 -intstyle ardent"));
}

TEST_F(SchematicParse, OutputGoesBesideTheHostLocationOfTheFileMadeCanonical) {
  InstallSchematicConverter();
  ScopedTempDir elsewhere;
  ASSERT_TRUE(Port::File::mkdir(elsewhere.Path("sub").c_str()));
  std::string path = Source("sheet.sch", "");
  file_ = AddNewFile(project_.Get(), path, "PLUGIN_Schematic");
  auto* reference = Prjrep::QueryAs<Vad::IFileCompReference>(file_.Get());
  ASSERT_NE(reference, nullptr);
  auto component = Host::FileComponent::Create(elsewhere.Path("sub/../sub//./placed.sch"));
  ASSERT_EQ(reference->setFileComponent(component.Get()), CitI::kOk);

  EXPECT_THAT(ParseAgain(), testing::Contains("|Module||kestrel line 1 file-named flag"));
  EXPECT_THAT(ToolLog("drawconv"), HasSubstr("|" + path + "|" + elsewhere.Path("sub/sheet.hrf") + "\n"));
  EXPECT_TRUE(Port::File::exist(elsewhere.Path("sub/sheet.hrf").c_str()));
  EXPECT_FALSE(Port::File::exist(sources_.Path("sheet.hrf").c_str()));
}

TEST_F(SchematicParse, WithoutOutputTheFileStandsForOneModuleAfterTheFailureIsReported) {
  InstallTool("drawconv", "exit 1\n");
  EXPECT_THAT(Parse(Source("sheet.sch", ""), "PLUGIN_Schematic"),
              ElementsAre("|Module||sheet line 0 file-named flag"));
  EXPECT_THAT(Messages(), ElementsAre(HasSubstr("Unable to run drawconv - Process Failed (")));

  Port::File::remove_r(tools_.Path("drawconv").c_str());
  EXPECT_THAT(ParseAgain(), ElementsAre("|Module||sheet line 0 file-named flag"));
  EXPECT_THAT(Messages(), ElementsAre(HasSubstr("Unable to run drawconv - Process Failed ("),
                                      HasSubstr("Unable to run drawconv - Bad Command Line (")));
}

}  // namespace
