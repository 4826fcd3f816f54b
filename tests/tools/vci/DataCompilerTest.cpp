#include <gtest/gtest.h>
#include <sys/stat.h>

#include <string>
#include <vector>

#include "VciTestSupport.h"
#include "vci/VerilogMessageText.h"

namespace {

using vci_test::InstanceNamesOf;
using vci_test::Module;
using vci_test::NamesOf;
using vci_test::Project;
using Strings = std::vector<std::string>;
namespace Text = Hx_Vci::VerilogMessageText;

using VerilogDataCompiler = vci_test::CompilerTest;

TEST_F(VerilogDataCompiler, FindsModulesPortsAndInstancesWithTheirSourceLines) {
  // Names built by macros; a macro call over two lines keeps the lines after it.
  ExpectCompiled(R"(`define TOP top_mod
`define CORE(unit) unit``_core
`define WIDTH(w, \
               d) [w-1:d]
module `TOP (input `WIDTH(8,
                         0) a);
endmodule
module `CORE(alu) (b);
endmodule
)",
                 {"top_mod:5(a)", "alu_core:8(b)"});
  // False conditional regions are left out.
  ExpectCompiled(R"(`define FPGA
`ifdef ASIC
module asic_only; endmodule
`elsif FPGA
  `ifndef FPGA
module never; endmodule
  `else
module fpga_only; endmodule
  `endif
`else
module fallback; endmodule
`endif
/* `ifdef in a comment does not count
*/ module after; endmodule
)",
                 {"fpga_only:8()", "after:14()"});
  // Instances in generate regions and blocks; calls in processes are none.
  ExpectCompiled(R"(module top #(parameter N = 4) (input clk);
  genvar i;
  generate
    for (i = 0; i < N; i = i + 1) begin : lanes
      lane #(.ID(i)) u_lane (.clk(clk));
    end
    if (N > 2) begin : wide
      wide_cell u_wide ();
    end else if (N > 1)
      mid_cell u_mid ();
    else begin
      narrow_cell u_narrow ();
    end
    case (N)
      1, 2: small_cell u_small ();
      default: begin : big big_cell u_big (); end
    endcase
  endgenerate
  begin : named
    named_cell u_named ();
  end
  always @(posedge clk) begin
    if (clk) task_call(clk);
    case (clk) 1'b1: begin other_call(clk); end endcase
  end
  after_cell u_after ();
endmodule
)",
                 {"top:1(clk) lane u_lane:5 wide_cell u_wide:8 mid_cell u_mid:10 narrow_cell u_narrow:12 "
                  "small_cell u_small:15 big_cell u_big:16 named_cell u_named:20 after_cell u_after:26"});
  // Several instances per statement, arrays and parameter overrides.
  ExpectCompiled(R"(module top;
  cell #(.W(8), .D(2)) u1 (.a(x), .b(y)),
                       u2 (.a(y), .b(x));
  cell u_arr[3:0] (bus);
  cell #(8, 4) u3 (a, b);
  cell #8 u4 (a);
  cell #WIDTH u5 (a), u6[1:0][2:0] (b);
endmodule
)",
                 {"top:1() cell u1:2 cell u2:3 cell u_arr:4 cell u3:5 cell u4:6 cell u5:7 cell u6:7"});
  // Escaped identifiers lose their backslash and blank.
  ExpectCompiled(R"(module \top.mod (\bus[0] , b);
  \sub$cell \u1[0] (.a(\bus[0] ));
endmodule
)",
                 {"top.mod:1(bus[0],b) sub$cell u1[0]:2"});
  // Gates, declarations, processes and primitives are no instances.
  ExpectCompiled(R"(primitive mux_udp (out, a, b, s);
  output out; input a, b, s;
  table 0 ? 0 : 0; endtable
endprimitive
module top (a, b, y);
  input a, b; output y;
  wire [3:0] w = 4'b0;
  and g1 (y, a, b);
  nand (weak0, strong1) #2 g2 (y, a, b), g3 (y, b, a);
  buf (y, a);
  assign y = a & b;
  (* keep = "yes; module fake; endmodule" *) cell u_attr (.a(a));
  mux_udp (strong0, strong1) u_udp (y, a, b, a);
  function f; input x; begin f = x; end endfunction
  task t; begin $display("cell u_fake (a);"); end endtask
  specify (a => y) = 1; endspecify
  initial begin : init reg r; r = 0; end
  always @(*) y2 = a;
  always @* begin y3 = b; end
  my_type var_of_user_type;
  last_cell u_last (a);
endmodule
)",
                 {"top:5(a,b,y) cell u_attr:12 last_cell u_last:21"});
  // The low-connection names the parser flags on.
  ExpectCompiled(R"(module ansi (input wire [3:0] a, output reg signed [7:0] q = 0,
             inout [W-1:0] io);
endmodule
module plain (a, b[3:0], c);
endmodule
module explicit (.x(a), .y());
endmodule
module concat ({a, b}, c);
endmodule
module empty_list ();
endmodule
module two_empty (,);
endmodule
module no_list;
endmodule
module with_params #(parameter P = 1) (input clk);
endmodule
module older_names (input config, output interface);
  assign interface = config;
  cell u_cell (.program(config));
endmodule
)",
                 {"ansi:1(a,q,io)", "plain:4(a,b,c)", "explicit:6(x,y)", "concat:8(,c)", "empty_list:10()",
                  "two_empty:12(,)", "no_list:14()", "with_params:16(clk)",
                  "older_names:18(config,interface) cell u_cell:20"});
}

// A primitive is known from its declaration on, in its own file or an earlier one of the compile,
// also when the files come from the cache.
TEST_F(VerilogDataCompiler, InstancesOfPrimitivesDeclaredInTheCompileAreNoModuleInstances) {
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

TEST_F(VerilogDataCompiler, MacrosOfEarlierFilesReachLaterOnesAndOnlyTheLastFileIsYielded) {
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

  EXPECT_TRUE(project.Compile({second}).empty());
  EXPECT_TRUE(messages.Has(vci_test::Format(Text::kUndefinedMacro, "LEAF_NAME")))
      << "alone, the later file does not know the macro: " << messages.All();
}

TEST_F(VerilogDataCompiler, UndefineAllForgetsEveryMacroUpToThatPointOnly) {
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

TEST_F(VerilogDataCompiler, DefineAndIncdirArgumentsAndIgnoredOptions) {
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

TEST_F(VerilogDataCompiler, IncludedModulesHaveTheirOwnFileLinesAndTheIncluderKeepsItsLines) {
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

TEST_F(VerilogDataCompiler, ProblemsAreHostMessagesWithFileAndLine) {
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

TEST_F(VerilogDataCompiler, AnswersNothingWithoutAReadableLastFile) {
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
