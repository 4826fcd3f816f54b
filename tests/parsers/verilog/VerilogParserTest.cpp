#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdint>
#include <filesystem>
#include <memory>
#include <string>
#include <vector>

#include "Port/MsgManData.h"
#include "SeededRandom.h"
#include "VerilogParser.h"
#include "VerilogTestFixture.h"
#include "vci/VerilogMessageLog.h"
#include "vci/VerilogMessageText.h"

using testing::Contains;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;
using verilog_test::VerilogProject;

namespace {

namespace Text = Hx_Vci::VerilogMessageText;

template <class... Args>
std::string CompilerText(const char* format, Args... args) {
  return Hx_Vci::VerilogMessageLog::Format(format, args...);
}

using VerilogParse = VerilogProject;

TEST_F(VerilogParse, PortFlagTellsWhetherTheFirstPortIsConnectedToANamedObject) {
  auto files = AddInOrder({{"ports.v",
                            "module no_ports;\n"
                            "endmodule\n"
                            "module named_ports (a, b);\n"
                            "  input a;\n  output b;\n"
                            "endmodule\n"
                            "module ansi_ports (input wire clk, output reg q);\n"
                            "endmodule\n"
                            "module concatenated_first ({a, b}, c);\n"
                            "  input a, b, c;\n"
                            "endmodule\n"
                            "module empty_first (, c);\n"
                            "  input c;\n"
                            "endmodule\n"
                            "macromodule empty_list ();\n"
                            "endmodule\n"}});
  ParseProject();
  EXPECT_THAT(
      Describe(files[0].Get()),
      ElementsAre("|Module||ansi_ports line 7 module flag", "|Module||concatenated_first line 9 module",
                  "|Module||empty_first line 12 module", "|Module||empty_list line 15 module",
                  "|Module||named_ports line 3 module flag", "|Module||no_ports line 1 module"));
}

TEST_F(VerilogParse, InstanceOfAProjectModuleIsAComponentInstanceNamedByItsInstanceName) {
  auto files = AddInOrder({{"leaf.v",
                            "module leaf (input a, output y);\n"
                            "  assign y = a;\n"
                            "endmodule\n"},
                           {"top.v",
                            "// the top\n"
                            "module top (input i, output o);\n"
                            "  leaf u_leaf (.a(i), .y(o));\n"
                            "endmodule\n"}});
  ParseProject();
  EXPECT_THAT(Describe(files[0].Get()), ElementsAre("|Module||leaf line 1 module flag"));
  EXPECT_THAT(Describe(files[1].Get()),
              ElementsAre("|ComponentInstantiation||top|top|u_leaf|leaf| line 3 instance parent |Module||top",
                          "|Module||top line 2 module flag"));
}

TEST_F(VerilogParse, EveryInstanceIsRecordedUnderTheModuleThatHoldsIt) {
  auto files = AddInOrder({{"many.v",
                            "module leaf; endmodule\n"
                            "module top;\n"
                            "  leaf a0 (), a1 ();\n"
                            "  leaf #(4) arr [3:0] ();\n"
                            "  generate\n"
                            "    if (1) begin : g\n"
                            "      leaf in_gen ();\n"
                            "    end\n"
                            "  endgenerate\n"
                            "endmodule\n"
                            "module other; leaf a0 (); endmodule\n"}});
  ParseProject();
  const std::string top = " instance parent |Module||top";
  EXPECT_THAT(
      Describe(files[0].Get()),
      ElementsAre("|ComponentInstantiation||other|other|a0|leaf| line 11 instance parent |Module||other",
                  "|ComponentInstantiation||top|top|a0|leaf| line 3" + top,
                  "|ComponentInstantiation||top|top|a1|leaf| line 3" + top,
                  "|ComponentInstantiation||top|top|arr|leaf| line 4" + top,
                  "|ComponentInstantiation||top|top|in_gen|leaf| line 7" + top, "|Module||leaf line 1 module",
                  "|Module||other line 11 module", "|Module||top line 2 module"));
}

TEST_F(VerilogParse, MacroOfAnEarlierFileIsKnownInALaterFileButNotTheOtherWayRound) {
  auto files = AddInOrder({{"defs.v",
                            "`define TOP_NAME chip_top\n"
                            "`define LEAF_OF(kind) kind\n"
                            "module leaf; endmodule\n"},
                           {"top.v",
                            "module `TOP_NAME;\n"
                            "  `LEAF_OF(leaf) u0 ();\n"
                            "endmodule\n"}});
  ParseProject();
  EXPECT_THAT(
      Describe(files[1].Get()),
      ElementsAre(
          "|ComponentInstantiation||chip_top|chip_top|u0|leaf| line 2 instance parent |Module||chip_top",
          "|Module||chip_top line 1 module"));

  // Now top.v comes first and is compiled alone: its macros are unknown, its module unnamed.
  files[0]->setOrderKey(10);
  files[0]->setNeedsParse(true);
  ParseProject();
  EXPECT_THAT(Describe(files[1].Get()), IsEmpty());
  EXPECT_THAT(Describe(files[0].Get()), ElementsAre("|Module||leaf line 3 module"));
}

TEST_F(VerilogParse, ChangedEarlierFileReachesTheLaterFilesWhenTheProjectIsParsedAgain) {
  auto files =
      AddInOrder({{"defs.v", "`define TOP_NAME first_top\n"}, {"top.v", "module `TOP_NAME; endmodule\n"}});
  ParseProject();
  ASSERT_THAT(Describe(files[1].Get()), ElementsAre("|Module||first_top line 1 module"));

  Write("defs.v", "`define TOP_NAME renamed_top_module\n");
  files[0]->setNeedsParse(true);  // what a host does when it sees the file changed
  ParseProject();
  EXPECT_THAT(Describe(files[1].Get()), ElementsAre("|Module||renamed_top_module line 1 module"));
}

TEST_F(VerilogParse, ModuleInsideAFalseConditionalIsNotRecorded) {
  auto files = AddInOrder({{"cond.v",
                            "`define HAVE_FAST\n"
                            "`ifdef HAVE_SLOW\n"
                            "module slow_path; endmodule\n"
                            "`else\n"
                            "module fallback; endmodule\n"
                            "`endif\n"
                            "`ifdef HAVE_FAST\n"
                            "module fast_path; endmodule\n"
                            "`endif\n"
                            "`ifndef HAVE_FAST\n"
                            "module not_fast; endmodule\n"
                            "`endif\n"}});
  ParseProject();
  EXPECT_THAT(Describe(files[0].Get()),
              ElementsAre("|Module||fallback line 5 module", "|Module||fast_path line 8 module"));

  // The project's macros reach the compiler.
  SetProperty(project_.Get(), "PROP_synVerilogMacros", "HAVE_SLOW=1");
  ParseProject();
  EXPECT_THAT(Describe(files[0].Get()),
              ElementsAre("|Module||fast_path line 8 module", "|Module||slow_path line 3 module"));
}

TEST_F(VerilogParse, IncludeFilesAreFoundInTheProjectIncludeDirectories) {
  std::filesystem::create_directory(Dir() + "include");
  Write("include/names.vh", "`define CORE_NAME shared_core\n");
  SetProperty(project_.Get(), "PROP_synVeriIncludeDir_Global", Dir() + "include");
  auto files = AddInOrder({{"core.v", "`include \"names.vh\"\nmodule `CORE_NAME; endmodule\n"}});
  ParseProject();
  EXPECT_THAT(Describe(files[0].Get()), ElementsAre("|Module||shared_core line 2 module"));
}

TEST_F(VerilogParse, BadInputGivesACapturedMessageAndKeepsWhatWasRecognised) {
  auto binary = AddVerilog(
      Write("binary.v", "module before_junk; endmodule\n" + SeededRandom(0x9E3779B97F4A7C15ull).Bytes(4096)),
      1);
  EXPECT_THAT(ParseAlone(binary.Get()), Not(IsEmpty()));
  EXPECT_THAT(Describe(binary.Get()), Contains("|Module||before_junk line 1 module"));

  auto self = AddVerilog(Write("self.v", "module kept; endmodule\n`include \"self.v\"\n"), 1);
  EXPECT_THAT(ParseAlone(self.Get()), HasSubstr("does a file include itself?"));
  EXPECT_THAT(Describe(self.Get()), Contains("|Module||kept line 1 module"));

  auto missing =
      AddVerilog(Write("missing.v", "`include \"absent.vh\"\nmodule after_missing; endmodule\n"), 1);
  EXPECT_THAT(ParseAlone(missing.Get()), HasSubstr(CompilerText(Text::kIncludeNotFound, "absent.vh")));
  EXPECT_THAT(Describe(missing.Get()), ElementsAre("|Module||after_missing line 2 module"));

  auto unreadable = AddVerilog(Dir() + "not_there.v", 1);
  EXPECT_THAT(ParseAlone(unreadable.Get()),
              HasSubstr(CompilerText(Text::kCannotOpen, (Dir() + "not_there.v").c_str())));
  EXPECT_THAT(Describe(unreadable.Get()), IsEmpty());
}

TEST_F(VerilogParse, HostManagersHearTheFilesOwnCompilerMessagesOnceWithFileAndLine) {
  test_host::MessageLog listening(/*enabled=*/true), silent(/*enabled=*/false);
  const std::string path = Write("noisy.v", "module noisy; `no_such_macro endmodule\nstray words;\n");
  auto noisy = AddVerilog(path, 1);

  EXPECT_THAT(ParseAlone(noisy.Get()), HasSubstr(CompilerText(Text::kUndefinedMacro, "no_such_macro")));
  EXPECT_THAT(Describe(noisy.Get()), ElementsAre("|Module||noisy line 1 module"));
  const std::vector<Port_MsgRecord>& heard = listening.Collector().records();
  ASSERT_FALSE(heard.empty());
  EXPECT_EQ(heard[0].type, Port_MsgMan::kError);
  EXPECT_EQ(heard[0].text, path + ":1: " + CompilerText(Text::kUndefinedMacro, "no_such_macro") + "\n");
  for (const Port_MsgRecord& record : heard) {
    EXPECT_EQ(record.category, "VerilogCompiler");
    EXPECT_EQ(record.sourceFile, path);
    EXPECT_GT(record.line, 0);
  }
  EXPECT_THAT(silent.Collector().records(), IsEmpty());
  ASSERT_TRUE(Port_MsgDispatcher::isRegistered(&listening.Collector()) &&
              Port_MsgDispatcher::isRegistered(&silent.Collector()));
  EXPECT_TRUE(listening.Collector().isEnabled());
  EXPECT_FALSE(silent.Collector().isEnabled());

  // Parsed again, the file's messages are heard again, once.
  const std::size_t once = heard.size();
  ParseAlone(noisy.Get());
  EXPECT_EQ(listening.Collector().records().size(), 2 * once);
}

}  // namespace
