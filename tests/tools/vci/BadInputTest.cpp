#include <gtest/gtest.h>

#include <random>
#include <string>
#include <vector>

#include "Port/InputLimits.h"
#include "VciTestSupport.h"
#include "vci/VerilogMessageText.h"
#include "vci/VerilogModuleParser.h"

namespace {

using Hx_Vci::VerilogMessageLog;
using vci_test::Module;
using vci_test::NamesOf;
using vci_test::Project;
using Strings = std::vector<std::string>;
namespace Text = Hx_Vci::VerilogMessageText;

using VerilogBadInput = vci_test::CompilerTest;

TEST_F(VerilogBadInput, FileIncludingItselfStopsAtTheDepthLimit) {
  const std::string path = project.Write("self.v",
                                         "module a; endmodule\n"
                                         "`include \"self.v\"\n"
                                         "module b; endmodule\n");
  std::vector<Module> modules = project.Compile({path});
  EXPECT_EQ(messages.With(VerilogMessageLog::Format(Text::kIncludeTooDeep, 64, "self.v")).size(), 1u)
      << messages.All();
  EXPECT_EQ(messages.records().size(), 1u) << messages.All();
  ASSERT_EQ(modules.size(), 2u * 65);
  EXPECT_EQ(modules.front().name, "a");
  EXPECT_EQ(modules.back().name, "b");
  EXPECT_EQ(modules.back().line, 3);
}

TEST_F(VerilogBadInput, IncludeFanOutStopsAtTheInclusionCountWithAMessage) {
  // Each header includes the next twice: 2^20 inclusions without a count.
  constexpr int kLevels = 20;
  for (int level = 0; level < kLevels; ++level) {
    const std::string next = "h" + std::to_string(level + 1) + ".vh";
    project.Write("h" + std::to_string(level) + ".vh",
                  "`include \"" + next + "\"\n`include \"" + next + "\"\n");
  }
  project.Write("h" + std::to_string(kLevels) + ".vh", "");
  const std::string path = project.Write("fan.v", "`include \"h0.vh\"\nmodule after; endmodule\n");
  std::vector<Module> modules = project.Compile({path});
  EXPECT_EQ(NamesOf(modules), (Strings{"after"}));
  const std::string expected =
      VerilogMessageLog::Format(Text::kTooManyIncludes, Port::InputLimits::kMaxIncludesPerFile);
  EXPECT_EQ(messages.With(expected).size(), 1u) << messages.All();
  EXPECT_EQ(messages.records().size(), 1u) << messages.All();
}

TEST_F(VerilogBadInput, BrokenSourcesAreReportedAtTheirLinesAndTheModulesAroundThemKept) {
  ExpectCompiled(
      R"(`define A `B
`define B `A x
module m1; endmodule
`A
`define SELF(x) `SELF(x)
`SELF(1)
module m2; endmodule
)",
      {"m1:3()", "m2:7()"},
      {"4: macro `A nests deeper than 64 expansions (recursive definition?); expansion stopped",
       "6: macro `SELF nests deeper than 64 expansions (recursive definition?); expansion stopped"});
  ExpectCompiled("module a; endmodule\n/* never closed\nmodule b; endmodule\n", {"a:1()"},
                 {"2: comment not terminated; the rest of the file is ignored"});
  ExpectCompiled(R"(module a; initial $display("oops);
endmodule
module b; endmodule
module c; initial $display("at the end)",
                 {"a:1()", "b:3()", "c:4()"},
                 {"1: string not terminated before the end of the line",
                  "4: string not terminated at the end of the file", "4: module c has no endmodule"});
  ExpectCompiled(R"(`endif
module a; endmodule
`ifdef NOT_DEFINED
`else
module b; endmodule
`else
module c; endmodule
)",
                 {"a:2()", "b:5()"},
                 {"1: `endif without `ifdef or `ifndef", "6: `else after `else",
                  "7: `ifdef or `ifndef of line 3 is not closed by `endif in this file"});
  // Missing endmodule and stray tokens.
  ExpectCompiled(
      R"(stray tokens here;
module a (x;
  cell u1 (.x(x);
module b; cell u2 (); end endmodule
endmodule
module c; cell u3 ()
  cell u4 ();
endmodule
)",
      {"a:2(x) cell u1:3", "b:4() cell u2:4", "c:6() cell u3:6 cell u4:7"},
      {"1: syntax error near \"stray\": a module was expected", "2: port list of module a is not terminated",
       "3: '(' without its closing ')'", "4: ',' or ';' expected after instance u1",
       "4: module a has no endmodule", "4: syntax error near \"end\"", "5: endmodule without module",
       "7: ',' or ';' expected after instance u3"});
}

TEST_F(VerilogBadInput, BinaryJunkGivesACappedNumberOfMessages) {
  std::mt19937 random(7);
  std::string junk;
  for (int i = 0; i < 300000; ++i) {
    junk.push_back(static_cast<char>(random() & 0xff));
    if (i % 1000 == 0) junk += "`x ` ( ) ; \" module";
  }
  bool compiled = false;
  project.Compile({project.Write("junk.bin", junk)}, &compiled);
  EXPECT_TRUE(compiled);
  ASSERT_EQ(messages.records().size(), VerilogMessageLog::kDefaultLimit + 1);
  EXPECT_EQ(messages.records().back().text, std::string(Text::kTooManyMessages) + "\n");
}

TEST_F(VerilogBadInput, HugeTokensAreTakenWhole) {
  const std::string name(4 << 20, 'n');
  std::vector<Module> modules = project.CompileText(
      "huge.v", "module " + name + "; initial $display(\"" + std::string(4 << 20, 's') + "\"); endmodule\n");
  ASSERT_EQ(modules.size(), 1u);
  EXPECT_EQ(modules[0].name, name);
  EXPECT_TRUE(messages.records().empty()) << messages.All();
}

TEST_F(VerilogBadInput, DeclarationWithoutSemicolonIsReportedAtItsNameAndTheNextItemStillCounts) {
  ExpectCompiled(R"(module a;
  wire w
  cell u1 (.x(w));
  integer i
  initial i = 0;
  parameter P = 4
  localparam Q = 5;
  reg r
endmodule
)",
                 {"a:1() cell u1:3"},
                 {"2: ';' expected after \"w\"", "4: ';' expected after \"i\"", "6: ';' expected after \"4\"",
                  "8: ';' expected after \"r\""});
  // Complete declarations of every form are quiet.
  ExpectCompiled(R"(module a (input wire clk, output reg [3:0] q);
  wire (strong0, weak1) #(1, 2) w = f(clk), v;
  reg [7:0] mem [0:3];
  logic signed [3:0] s = int'(clk);
  input my_t port_a;
  parameter integer P = 4, Q = P + 1;
  localparam [3:0] A = {2'b01, 2'b10};
  genvar g;
  and g1 (w, clk, v);
  cell u1 (.x(w));
endmodule
)",
                 {"a:1(clk,q) cell u1:10"});
}

TEST_F(VerilogBadInput, DeepNestingIsCutWithoutExhaustingTheStack) {
  std::string deep = "module a;\n";
  for (int i = 0; i < 20000; ++i) deep += "begin if (x) ";
  deep += "cell u_deep ();";
  for (int i = 0; i < 20000; ++i) deep += " end";
  deep += "\nalways";
  for (int i = 0; i < 20000; ++i) deep += " if (x)";
  deep += " y = 1; else y = 0;\n  cell u_after ();\nendmodule\nmodule b; endmodule\n";
  std::vector<Module> modules = project.CompileText("deep.v", deep);
  ASSERT_EQ(NamesOf(modules), (Strings{"a", "b"})) << messages.All();
  EXPECT_EQ(vci_test::InstanceNamesOf(modules[0]).back(), "cell u_after");
  EXPECT_TRUE(messages.Has(
      VerilogMessageLog::Format(Text::kNestingTooDeep, Hx_Vci::VerilogModuleParser::kMaxNesting)))
      << messages.All();
}

TEST_F(VerilogBadInput, IncludeOfADirectoryCannotBeRead) {
  ASSERT_EQ(::mkdir(project.Path("dir.vh").c_str(), 0700), 0);
  std::vector<Module> modules = project.CompileText("inc.v",
                                                    "`include \"dir.vh\"\n"
                                                    "`include\n"
                                                    "module a; endmodule\n");
  EXPECT_EQ(NamesOf(modules), Strings{"a"});
  EXPECT_TRUE(messages.Has(vci_test::Format(Text::kIncludeUnreadable, project.Path("dir.vh"))))
      << messages.All();
  EXPECT_TRUE(messages.Has(Text::kIncludeNeedsFile)) << messages.All();
}

TEST_F(VerilogBadInput, RandomlyDamagedSourcesNeverBreakTheCompiler) {
  project.Write("defs.vh", "`define W 8\n`define ADD(a, b) ((a) + (b))\n");
  const std::string original =
      "`timescale 1ns/1ps\n`include \"defs.vh\"\n"
      "// a comment with `ifdef and \"quotes\"\n"
      "module top #(parameter N = `W) (input clk, input [N-1:0] a, output reg [N-1:0] q);\n"
      "  wire [N-1:0] s = `ADD(a, 1);\n"
      "  /* block\n comment */ (* keep *) sub #(.W(N)) u_sub (.a(a), .y(s)), u_two (.a(s));\n"
      "  generate for (genvar i = 0; i < 2; i++) begin : g\n"
      "    if (i == 0) leaf u_leaf (\\esc[0] ); else leaf u_other ();\n"
      "  end endgenerate\n"
      "`ifdef W\n  always @(posedge clk) begin q <= s; $display(\"q=%d\", q); end\n`else\n  x y;\n`endif\n"
      "  function f; input v; f = v; endfunction\n"
      "endmodule\n";
  std::mt19937 random(11);
  const std::string specials = "`\"/*()[]{};,\\\n#.:=$'";
  for (int round = 0; round < 300; ++round) {
    std::string text = original;
    const int edits = 1 + static_cast<int>(random() % 6);
    for (int e = 0; e < edits && !text.empty(); ++e) {
      const std::size_t at = random() % text.size();
      const char c = random() % 2 ? specials[random() % specials.size()] : static_cast<char>(random() & 0xff);
      switch (random() % 3) {
        case 0:
          text.erase(at, 1 + random() % 8);
          break;
        case 1:
          text.insert(at, 1, c);
          break;
        default:
          text[at] = c;
          break;
      }
    }
    bool compiled = false;
    project.Compile({project.Write("damaged.v", text)}, &compiled);
    ASSERT_TRUE(compiled) << text;
    ASSERT_LE(messages.records().size(), VerilogMessageLog::kDefaultLimit + 1) << text;
    messages.clear();
  }
}

}  // namespace
