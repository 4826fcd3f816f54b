#include <gtest/gtest.h>
#include <sys/stat.h>

#include <string>
#include <vector>

#include "VciTestSupport.h"
#include "vci/VerilogMessageText.h"

namespace {

using vci_test::InstanceNamesOf;
using vci_test::MessageCapture;
using vci_test::Module;
using vci_test::NamesOf;
using vci_test::Project;
using Strings = std::vector<std::string>;
namespace Text = Hx_Vci::VerilogMessageText;

TEST(VerilogDataCompiler, ModuleNamesBuiltByMacrosKeepTheirSourceLines) {
  MessageCapture messages;
  Project project;
  std::vector<Module> modules = project.CompileText("names.v",
                                                    "`define TOP top_mod\n"
                                                    "`define CORE(unit) unit``_core\n"
                                                    "`define WIDTH(w, \\\n"
                                                    "               d) [w-1:d]\n"
                                                    "module `TOP (input `WIDTH(8,\n"
                                                    "                         0) a);\n"
                                                    "endmodule\n"
                                                    "module `CORE(alu) (b);\n"
                                                    "endmodule\n");
  ASSERT_EQ(NamesOf(modules), (Strings{"top_mod", "alu_core"})) << messages.All();
  EXPECT_EQ(modules[0].line, 5);
  EXPECT_EQ(modules[1].line, 8) << "a macro call over two lines keeps the lines after it";
  EXPECT_EQ(modules[0].lowConnections, Strings{"a"});
  EXPECT_TRUE(messages.records().empty()) << messages.All();
}

TEST(VerilogDataCompiler, ModulesInFalseConditionalRegionsAreLeftOut) {
  Project project;
  std::vector<Module> modules = project.CompileText("cond.v",
                                                    "`define FPGA\n"
                                                    "`ifdef ASIC\n"
                                                    "module asic_only; endmodule\n"
                                                    "`elsif FPGA\n"
                                                    "  `ifndef FPGA\n"
                                                    "module never; endmodule\n"
                                                    "  `else\n"
                                                    "module fpga_only; endmodule\n"
                                                    "  `endif\n"
                                                    "`else\n"
                                                    "module fallback; endmodule\n"
                                                    "`endif\n"
                                                    "/* `ifdef in a comment does not count\n"
                                                    "*/ module after; endmodule\n");
  ASSERT_EQ(NamesOf(modules), (Strings{"fpga_only", "after"}));
  EXPECT_EQ(modules[0].line, 8);
  EXPECT_EQ(modules[1].line, 14);
}

TEST(VerilogDataCompiler, FindsInstancesInGenerateRegionsAndBlocks) {
  Project project;
  std::vector<Module> modules =
      project.CompileText("gen.v",
                          "module top #(parameter N = 4) (input clk);\n"
                          "  genvar i;\n"
                          "  generate\n"
                          "    for (i = 0; i < N; i = i + 1) begin : lanes\n"
                          "      lane #(.ID(i)) u_lane (.clk(clk));\n"
                          "    end\n"
                          "    if (N > 2) begin : wide\n"
                          "      wide_cell u_wide ();\n"
                          "    end else if (N > 1)\n"
                          "      mid_cell u_mid ();\n"
                          "    else begin\n"
                          "      narrow_cell u_narrow ();\n"
                          "    end\n"
                          "    case (N)\n"
                          "      1, 2: small_cell u_small ();\n"
                          "      default: begin : big big_cell u_big (); end\n"
                          "    endcase\n"
                          "  endgenerate\n"
                          "  begin : named\n"
                          "    named_cell u_named ();\n"
                          "  end\n"
                          "  always @(posedge clk) begin\n"
                          "    if (clk) task_call(clk);\n"
                          "    case (clk) 1'b1: begin other_call(clk); end endcase\n"
                          "  end\n"
                          "  after_cell u_after ();\n"
                          "endmodule\n");
  ASSERT_EQ(modules.size(), 1u);
  EXPECT_EQ(InstanceNamesOf(modules[0]),
            (Strings{"lane u_lane", "wide_cell u_wide", "mid_cell u_mid", "narrow_cell u_narrow",
                     "small_cell u_small", "big_cell u_big", "named_cell u_named", "after_cell u_after"}));
  EXPECT_EQ(modules[0].instances[0].line, 5);
  EXPECT_EQ(modules[0].instances.back().line, 26);
}

TEST(VerilogDataCompiler, ReadsSeveralInstancesPerStatementArraysAndParameterOverrides) {
  Project project;
  std::vector<Module> modules = project.CompileText("inst.v",
                                                    "module top;\n"
                                                    "  cell #(.W(8), .D(2)) u1 (.a(x), .b(y)),\n"
                                                    "                       u2 (.a(y), .b(x));\n"
                                                    "  cell u_arr[3:0] (bus);\n"
                                                    "  cell #(8, 4) u3 (a, b);\n"
                                                    "  cell #8 u4 (a);\n"
                                                    "  cell #WIDTH u5 (a), u6[1:0][2:0] (b);\n"
                                                    "endmodule\n");
  ASSERT_EQ(modules.size(), 1u);
  EXPECT_EQ(InstanceNamesOf(modules[0]),
            (Strings{"cell u1", "cell u2", "cell u_arr", "cell u3", "cell u4", "cell u5", "cell u6"}));
  EXPECT_EQ(modules[0].instances[0].line, 2);
  EXPECT_EQ(modules[0].instances[1].line, 3);
}

TEST(VerilogDataCompiler, EscapedIdentifiersLoseTheirBackslashAndBlank) {
  Project project;
  std::vector<Module> modules = project.CompileText("esc.v",
                                                    "module \\top.mod (\\bus[0] , b);\n"
                                                    "  \\sub$cell \\u1[0] (.a(\\bus[0] ));\n"
                                                    "endmodule\n");
  ASSERT_EQ(NamesOf(modules), Strings{"top.mod"});
  EXPECT_EQ(modules[0].lowConnections, (Strings{"bus[0]", "b"}));
  EXPECT_EQ(InstanceNamesOf(modules[0]), Strings{"sub$cell u1[0]"});
}

TEST(VerilogDataCompiler, GatesDeclarationsProcessesAndPrimitivesAreNoInstances) {
  MessageCapture messages;
  Project project;
  std::vector<Module> modules =
      project.CompileText("skip.v",
                          "primitive mux_udp (out, a, b, s);\n"
                          "  output out; input a, b, s;\n"
                          "  table 0 ? 0 : 0; endtable\n"
                          "endprimitive\n"
                          "module top (a, b, y);\n"
                          "  input a, b; output y;\n"
                          "  wire [3:0] w = 4'b0;\n"
                          "  and g1 (y, a, b);\n"
                          "  nand (weak0, strong1) #2 g2 (y, a, b), g3 (y, b, a);\n"
                          "  buf (y, a);\n"
                          "  assign y = a & b;\n"
                          "  (* keep = \"yes; module fake; endmodule\" *) cell u_attr (.a(a));\n"
                          "  mux_udp (strong0, strong1) u_udp (y, a, b, a);\n"
                          "  function f; input x; begin f = x; end endfunction\n"
                          "  task t; begin $display(\"cell u_fake (a);\"); end endtask\n"
                          "  specify (a => y) = 1; endspecify\n"
                          "  initial begin : init reg r; r = 0; end\n"
                          "  always @(*) y2 = a;\n"
                          "  always @* begin y3 = b; end\n"
                          "  my_type var_of_user_type;\n"
                          "  last_cell u_last (a);\n"
                          "endmodule\n");
  ASSERT_EQ(NamesOf(modules), Strings{"top"});
  EXPECT_EQ(InstanceNamesOf(modules[0]), (Strings{"cell u_attr", "last_cell u_last"}));
  EXPECT_TRUE(messages.records().empty()) << messages.All();
}

// A primitive is known from its declaration on, in its own file or an earlier one of the compile,
// also when the files come from the cache.
TEST(VerilogDataCompiler, InstancesOfPrimitivesDeclaredInTheCompileAreNoModuleInstances) {
  MessageCapture messages;
  Project project;
  const std::string cells = project.Write("cells.v",
                                          "primitive early_udp (o, a); output o; input a;\n"
                                          "  table 0 : 1; 1 : 0; endtable\nendprimitive\n");
  const std::string plain = project.Write("plain.v", "module plain; endmodule\n");
  const std::string top = project.Write("top.v",
                                        "module top (input a, output o);\n"
                                        "  early_udp u_early (o, a);\n"
                                        "  own_udp u_own (o, a);\n"
                                        "  late_udp u_late (o, a);\n"
                                        "  plain u_plain ();\n"
                                        "endmodule\n"
                                        "primitive own_udp (o, a); output o; input a;\n"
                                        "  table 0 : 1; 1 : 0; endtable\nendprimitive\n");
  const std::string late = project.Write("late.v",
                                         "primitive late_udp (o, a); output o; input a;\n"
                                         "  table 0 : 1; 1 : 0; endtable\nendprimitive\n");
  for (int round = 0; round < 2; ++round) {
    EXPECT_EQ(InstanceNamesOf(project.Compile({top}).at(0)),
              (Strings{"early_udp u_early", "late_udp u_late", "plain u_plain"}));
    project.Compile({cells, plain});
    EXPECT_EQ(InstanceNamesOf(project.Compile({cells, plain, top}).at(0)),
              (Strings{"late_udp u_late", "plain u_plain"}));
    EXPECT_EQ(InstanceNamesOf(project.Compile({late, top}).at(0)),
              (Strings{"early_udp u_early", "plain u_plain"}));
  }
  EXPECT_EQ(project.cache()->ScannedFileCount(), 4u);
  EXPECT_TRUE(messages.records().empty()) << messages.All();
}

TEST(VerilogDataCompiler, PortsGiveTheLowConnectionNamesTheParserFlagsOn) {
  Project project;
  std::vector<Module> modules =
      project.CompileText("ports.v",
                          "module ansi (input wire [3:0] a, output reg signed [7:0] q = 0,\n"
                          "             inout [W-1:0] io);\n"
                          "endmodule\n"
                          "module plain (a, b[3:0], c);\n"
                          "endmodule\n"
                          "module explicit (.x(a), .y());\n"
                          "endmodule\n"
                          "module concat ({a, b}, c);\n"
                          "endmodule\n"
                          "module empty_list ();\n"
                          "endmodule\n"
                          "module two_empty (,);\n"
                          "endmodule\n"
                          "module no_list;\n"
                          "endmodule\n"
                          "module with_params #(parameter P = 1) (input clk);\n"
                          "endmodule\n"
                          "module older_names (input config, output interface);\n"
                          "  assign interface = config;\n"
                          "  cell u_cell (.program(config));\n"
                          "endmodule\n");
  ASSERT_EQ(modules.size(), 9u);
  EXPECT_EQ(modules[0].lowConnections, (Strings{"a", "q", "io"}));
  EXPECT_EQ(modules[1].lowConnections, (Strings{"a", "b", "c"}));
  EXPECT_EQ(modules[2].lowConnections, (Strings{"x", "y"}));
  EXPECT_EQ(modules[3].lowConnections, (Strings{"", "c"}));
  EXPECT_EQ(modules[4].lowConnections, Strings{""});
  EXPECT_EQ(modules[5].lowConnections, (Strings{"", ""}));
  EXPECT_TRUE(modules[6].lowConnections.empty());
  EXPECT_EQ(modules[7].lowConnections, Strings{"clk"});
  EXPECT_EQ(modules[8].lowConnections, (Strings{"config", "interface"}));
  EXPECT_EQ(InstanceNamesOf(modules[8]), Strings{"cell u_cell"});
}

TEST(VerilogDataCompiler, MacrosOfEarlierFilesReachLaterOnesAndOnlyTheLastFileIsYielded) {
  Project project;
  const std::string first = project.Write("defs.v",
                                          "`define LEAF_NAME leaf\n"
                                          "module in_first_file; endmodule\n");
  const std::string second = project.Write("leaf.v", "module `LEAF_NAME (input a); endmodule\n");
  const std::string third = project.Write("top.v",
                                          "module top;\n"
                                          "  `LEAF_NAME u_leaf (.a(1'b0));\n"
                                          "endmodule\n");

  std::vector<Module> modules = project.Compile({first, second, third});
  ASSERT_EQ(NamesOf(modules), Strings{"top"});
  EXPECT_EQ(InstanceNamesOf(modules[0]), Strings{"leaf u_leaf"});
  EXPECT_EQ(NamesOf(project.Compile({first, second})), Strings{"leaf"});
  EXPECT_EQ(NamesOf(project.Compile({first})), Strings{"in_first_file"});

  MessageCapture messages;
  EXPECT_TRUE(project.Compile({second}).empty());
  EXPECT_TRUE(messages.Has(vci_test::Format(Text::kUndefinedMacro, "LEAF_NAME")))
      << "alone, the later file does not know the macro: " << messages.All();
}

TEST(VerilogDataCompiler, UndefineAllForgetsEveryMacroUpToThatPointOnly) {
  MessageCapture messages;
  Project project;
  const std::string defs = project.Write("defs.v",
                                         "`define EARLY 1\n"
                                         "`undefineall\n"
                                         "`define LATE 1\n");
  const std::string probe = project.Write("probe.v",
                                          "`ifdef FROM_LINE module saw_line; endmodule `endif\n"
                                          "`ifdef EARLY module saw_early; endmodule `endif\n"
                                          "`ifdef LATE module saw_late; endmodule `endif\n");
  EXPECT_EQ(NamesOf(project.Compile({defs, probe, "+define+FROM_LINE"})), Strings{"saw_late"});
  EXPECT_EQ(NamesOf(project.Compile({probe, "+define+FROM_LINE"})), Strings{"saw_line"});
  EXPECT_TRUE(messages.records().empty()) << messages.All();
}

TEST(VerilogDataCompiler, DefineAndIncdirArgumentsAndIgnoredOptions) {
  MessageCapture messages;
  Project project;
  ASSERT_EQ(::mkdir(project.Path("inc_a").c_str(), 0700), 0);
  ASSERT_EQ(::mkdir(project.Path("inc_b").c_str(), 0700), 0);
  ASSERT_EQ(::mkdir(project.Path("src").c_str(), 0700), 0);
  project.Write("inc_a/first.vh", "`define FROM_A a_wins\n");
  project.Write("inc_b/first.vh", "`define FROM_A b_loses\n");
  project.Write("inc_b/second.vh", "`define FROM_B found_in_b\n");
  project.Write("src/local.vh", "`define LOCAL local_dir_first\n");
  project.Write("inc_a/local.vh", "`define LOCAL include_dir_second\n");
  const std::string source = project.Write("src/top.v",
                                           "`include \"first.vh\"\n"
                                           "`include \"second.vh\"\n"
                                           "`include \"local.vh\"\n"
                                           "module `FROM_A; endmodule\n"
                                           "module `FROM_B; endmodule\n"
                                           "module `LOCAL; endmodule\n"
                                           "`ifdef B module `NAME_`C; endmodule `endif\n"
                                           "module value_`A; endmodule\n");

  std::vector<Module> modules =
      project.Compile({source, "+dora+dataparser+CR172701", "+qtx_client", "+define+A=1+B+C=x+NAME_=n_",
                       "+incdir+" + project.Path("inc_a") + "+" + project.Path("inc_b")});
  EXPECT_EQ(NamesOf(modules), (Strings{"a_wins", "found_in_b", "local_dir_first", "n_x", "value_1"}))
      << messages.All();
  EXPECT_EQ(modules[4].line, 8);
  EXPECT_TRUE(messages.records().empty()) << messages.All();
}

TEST(VerilogDataCompiler, IncludedModulesHaveTheirOwnFileLinesAndTheIncluderKeepsItsLines) {
  MessageCapture messages;
  Project project;
  project.Write("sub.vh",
                "\n"
                "module in_header; endmodule\n"
                "`define HEADER_DONE\n");
  const std::string source = project.Write("top.v",
                                           "module before; endmodule\n"
                                           "`include \"sub.vh\"\n"
                                           "`ifdef HEADER_DONE\n"
                                           "module after; endmodule\n"
                                           "`endif\n");
  std::vector<Module> modules = project.Compile({source});
  ASSERT_EQ(NamesOf(modules), (Strings{"before", "in_header", "after"}));
  EXPECT_EQ(modules[1].line, 2);
  EXPECT_EQ(modules[2].line, 4);
  EXPECT_TRUE(messages.records().empty()) << messages.All();
}

TEST(VerilogDataCompiler, ProblemsAreHostMessagesWithFileAndLine) {
  MessageCapture messages;
  Project project;
  const std::string path = project.Write("bad.v",
                                         "module ok; endmodule\n"
                                         "`include \"missing.vh\"\n"
                                         "module m (a, b;\n"
                                         "  ) junk\n"
                                         "endmodule\n"
                                         "module after; endmodule\n");
  std::vector<Module> modules = project.Compile({path});
  EXPECT_EQ(NamesOf(modules), (Strings{"ok", "m", "after"}));
  std::vector<Port_MsgRecord> missing = messages.With(vci_test::Format(Text::kIncludeNotFound, "missing.vh"));
  ASSERT_EQ(missing.size(), 1u) << messages.All();
  EXPECT_EQ(missing[0].type, Port_MsgMan::kError);
  EXPECT_EQ(missing[0].category, "VerilogCompiler");
  EXPECT_EQ(missing[0].sourceFile, path);
  EXPECT_EQ(missing[0].line, 2);
  std::vector<Port_MsgRecord> unterminated =
      messages.With(vci_test::Format(Text::kPortListUnterminated, "m"));
  ASSERT_EQ(unterminated.size(), 1u) << messages.All();
  EXPECT_EQ(unterminated[0].line, 3);
}

TEST(VerilogDataCompiler, AnswersNothingWithoutAReadableLastFile) {
  MessageCapture messages;
  Project project;
  bool compiled = true;
  EXPECT_TRUE(project.Compile({"+define+A"}, &compiled).empty());
  EXPECT_FALSE(compiled);
  EXPECT_TRUE(messages.Has(Text::kNoSourceFile));

  const std::string missing = project.Path("missing.v");
  project.Compile({missing}, &compiled);
  EXPECT_FALSE(compiled);
  EXPECT_TRUE(messages.Has(vci_test::Format(Text::kCannotOpen, missing))) << messages.All();

  const std::string good = project.Write("good.v", "module good; endmodule\n");
  EXPECT_EQ(NamesOf(project.Compile({missing, good}, &compiled)), Strings{"good"});
  EXPECT_TRUE(compiled) << "an unreadable earlier file does not stop the compile";

  Hx_Vci::DataCompiler compiler(project.cache());
  EXPECT_EQ(compiler.compile(0, nullptr), nullptr);
  const char* withNull[] = {"commandname", nullptr, good.c_str()};
  EXPECT_NE(compiler.compile(3, withNull), nullptr);
}

}  // namespace
