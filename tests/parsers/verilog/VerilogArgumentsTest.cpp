#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "VerilogArguments.h"
#include "VerilogTestFixture.h"

using testing::Contains;
using testing::ElementsAre;
using testing::Not;
using Vad::VerilogArguments;
using verilog_test::VerilogProject;

namespace {

constexpr const char* kNoLocalInclude = VerilogArguments::kNoLocalIncludeVariable;
const std::string kDataParser = VerilogArguments::kDataParserOption;
const std::string kClient = VerilogArguments::kClientOption;

class VerilogArgumentVector : public VerilogProject {
 protected:
  // The arguments of a lone file of the project, under the properties set so far.
  std::vector<std::string> ArgumentsOfLoneFile() {
    if (!file_) file_ = AddVerilog(Write("lone.v", "module lone; endmodule\n"), 1);
    return ArgumentsOf(file_.Get());
  }
  std::string LonePath() const { return Dir() + "lone.v"; }

  Prjrep::AutoPtr<Vad::IHdlFile> file_;
};

TEST_F(VerilogArgumentVector, FirstFileIsCompiledAloneAndTheThirdAfterTheFirstTwoInProjectOrder) {
  // Project order comes from the order keys, not from the names.
  auto files = AddInOrder({{"c_first.v", "module first; endmodule\n"},
                           {"a_second.v", "module second; endmodule\n"},
                           {"b_third.v", "module third; endmodule\n"}});
  AddNewFile(project_.Get(), Write("d.vhd", "entity d is end;\n"), "PLUGIN_Vhdl");
  ParseProject();

  const std::string first = Dir() + "c_first.v", second = Dir() + "a_second.v", third = Dir() + "b_third.v";
  const std::string localInclude = "+incdir+" + Dir();
  EXPECT_THAT(ArgumentsOf(files[0].Get()), ElementsAre("commandname", first, kDataParser, localInclude));
  EXPECT_THAT(ArgumentsOf(files[1].Get()),
              ElementsAre("commandname", first, second, kDataParser, localInclude));
  EXPECT_THAT(ArgumentsOf(files[2].Get()),
              ElementsAre("commandname", first, second, third, kDataParser, localInclude));
}

TEST_F(VerilogArgumentVector, FileMissingFromItsSiblingListIsCompiledAfterAllOfThem) {
  auto files = AddInOrder({{"one.v", "module one; endmodule\n"}, {"two.v", "module two; endmodule\n"}});
  auto outsider = AddVerilog(Write("outsider.v", "module outsider; endmodule\n"), 500, /*v3=*/false);
  ParseProject();

  EXPECT_THAT(ArgumentsOf(outsider.Get()),
              ElementsAre("commandname", Dir() + "one.v", Dir() + "two.v", Dir() + "outsider.v", kDataParser,
                          "+incdir+" + Dir()));
}

TEST_F(VerilogArgumentVector, OptionsFollowTheFilesInTheirFixedOrder) {
  SetProperty(project_.Get(), "PROP_Parse_Target", "Synthesis");
  SetProperty(project_.Get(), "PROP_synVerilogMacros", "A=1;B|C");
  SetProperty(project_.Get(), "PROP_synVeriIncludeDir_Global", "inc1;inc2");
  ScopedEnv localIncludes(kNoLocalInclude, nullptr);

  EXPECT_THAT(ArgumentsOfLoneFile(), ElementsAre("commandname", LonePath(), kDataParser, kClient,
                                                 "+define+A=1+B+C", "+incdir+inc1+inc2+" + Dir()));
}

TEST_F(VerilogArgumentVector, ClientOptionOnlyForTheSynthesisTargetInAnyLetterCase) {
  EXPECT_THAT(ArgumentsOfLoneFile(), Not(Contains(kClient))) << "no target property";
  for (const char* target : {"synthesis", "SYNTHESIS", "Synthesis"}) {
    SetProperty(project_.Get(), "PROP_Parse_Target", target);
    EXPECT_THAT(ArgumentsOfLoneFile(), Contains(kClient)) << target;
  }
  for (const char* target : {"Simulation", "Synthesis ", "Synth", ""}) {
    SetProperty(project_.Get(), "PROP_Parse_Target", target);
    EXPECT_THAT(ArgumentsOfLoneFile(), Not(Contains(kClient))) << "'" << target << "'";
  }
}

TEST_F(VerilogArgumentVector, MacroListBecomesOneDefineOptionUnlessEmpty) {
  ScopedEnv localIncludes(kNoLocalInclude, "1");
  SetProperty(project_.Get(), "PROP_synVerilogMacros", "");
  EXPECT_THAT(ArgumentsOfLoneFile(), ElementsAre("commandname", LonePath(), kDataParser));
  SetProperty(project_.Get(), "PROP_synVerilogMacros", "WIDTH=8|DEBUG;;SIM=");
  EXPECT_THAT(ArgumentsOfLoneFile(),
              ElementsAre("commandname", LonePath(), kDataParser, "+define+WIDTH=8+DEBUG++SIM="));
}

TEST_F(VerilogArgumentVector, IncludeListEndsWithTheFileDirectoryUnlessLocalIncludesAreDisabled) {
  {
    ScopedEnv localIncludes(kNoLocalInclude, nullptr);
    EXPECT_THAT(ArgumentsOfLoneFile(), Contains("+incdir+" + Dir())) << "no include property";
    SetProperty(project_.Get(), "PROP_synVeriIncludeDir_Global", "inc1;inc2");
    EXPECT_THAT(ArgumentsOfLoneFile(), Contains("+incdir+inc1+inc2+" + Dir()));
    SetProperty(project_.Get(), "PROP_synVeriIncludeDir_Global", "/x/inc1|inc2");
    EXPECT_THAT(ArgumentsOfLoneFile(), Contains("+incdir+/x/inc1+inc2+" + Dir()));
  }
  {
    ScopedEnv localIncludes(kNoLocalInclude, "");  // set, even to nothing
    SetProperty(project_.Get(), "PROP_synVeriIncludeDir_Global", "inc1;inc2");
    EXPECT_THAT(ArgumentsOfLoneFile(),
                ElementsAre("commandname", LonePath(), kDataParser, "+incdir+inc1+inc2"));
    SetProperty(project_.Get(), "PROP_synVeriIncludeDir_Global", "");
    EXPECT_THAT(ArgumentsOfLoneFile(), ElementsAre("commandname", LonePath(), kDataParser));
  }
}

TEST_F(VerilogArgumentVector, FileWithoutAProjectGetsNoConfiguredOptions) {
  SetProperty(project_.Get(), "PROP_Parse_Target", "Synthesis");
  auto loose =
      NewFile(project_.Get(), Write("loose.v", "module loose; endmodule\n"), verilog_test::kVerilogPlugin);
  EXPECT_THAT(ArgumentsOf(loose.Get()), ElementsAre("commandname", Dir() + "loose.v", kDataParser));
}

}  // namespace
