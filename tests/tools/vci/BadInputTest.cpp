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
using vci_test::MessageCapture;
using vci_test::Module;
using vci_test::NamesOf;
using vci_test::Project;
using Strings = std::vector<std::string>;
namespace Text = Hx_Vci::VerilogMessageText;

TEST(VerilogBadInput, FileIncludingItselfStopsAtTheDepthLimit) {
  MessageCapture messages;
  Project project;
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

TEST(VerilogBadInput, IncludeFanOutStopsAtTheInclusionCountWithAMessage) {
  MessageCapture messages;
  Project project;
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

TEST(VerilogBadInput, MutuallyRecursiveMacrosStopWithAMessage) {
  MessageCapture messages;
  Project project;
  std::vector<Module> modules = project.CompileText("recursive.v",
                                                    "`define A `B\n"
                                                    "`define B `A x\n"
                                                    "module m1; endmodule\n"
                                                    "`A\n"
                                                    "`define SELF(x) `SELF(x)\n"
                                                    "`SELF(1)\n"
                                                    "module m2; endmodule\n");
  EXPECT_EQ(NamesOf(modules), (Strings{"m1", "m2"}));
  EXPECT_EQ(modules[1].line, 7);
  EXPECT_EQ(messages.With(VerilogMessageLog::Format(Text::kMacroTooDeep, "A", 64)).size(), 1u)
      << messages.All();
  EXPECT_EQ(messages.With(VerilogMessageLog::Format(Text::kMacroTooDeep, "SELF", 64)).size(), 1u)
      << messages.All();
}

TEST(VerilogBadInput, UnterminatedCommentEndsTheFileAndKeepsWhatCameBefore) {
  MessageCapture messages;
  Project project;
  std::vector<Module> modules = project.CompileText("comment.v",
                                                    "module a; endmodule\n"
                                                    "/* never closed\n"
                                                    "module b; endmodule\n");
  EXPECT_EQ(NamesOf(modules), Strings{"a"});
  std::vector<Port_MsgRecord> found = messages.With(Text::kUnterminatedComment);
  ASSERT_EQ(found.size(), 1u) << messages.All();
  EXPECT_EQ(found[0].line, 2);
}

TEST(VerilogBadInput, UnterminatedStringsAreClosedAtTheirLineOrFileEnd) {
  MessageCapture messages;
  Project project;
  std::vector<Module> modules = project.CompileText("string.v",
                                                    "module a; initial $display(\"oops);\n"
                                                    "endmodule\n"
                                                    "module b; endmodule\n"
                                                    "module c; initial $display(\"at the end");
  EXPECT_EQ(NamesOf(modules), (Strings{"a", "b", "c"}));
  ASSERT_EQ(messages.With(Text::kUnterminatedString).size(), 1u) << messages.All();
  EXPECT_EQ(messages.With(Text::kUnterminatedString)[0].line, 1);
  EXPECT_EQ(messages.With(Text::kUnterminatedStringAtEnd).size(), 1u) << messages.All();
}

TEST(VerilogBadInput, UnbalancedConditionalsAreReported) {
  MessageCapture messages;
  Project project;
  std::vector<Module> modules = project.CompileText("ifdef.v",
                                                    "`endif\n"
                                                    "module a; endmodule\n"
                                                    "`ifdef NOT_DEFINED\n"
                                                    "`else\n"
                                                    "module b; endmodule\n"
                                                    "`else\n"
                                                    "module c; endmodule\n");
  EXPECT_EQ(NamesOf(modules), (Strings{"a", "b"}));
  EXPECT_TRUE(messages.Has(vci_test::Format(Text::kConditionalWithoutIf, "endif"))) << messages.All();
  EXPECT_TRUE(messages.Has(vci_test::Format(Text::kConditionalAfterElse, "else"))) << messages.All();
  std::vector<Port_MsgRecord> open =
      messages.With(VerilogMessageLog::Format(Text::kUnterminatedConditional, 3));
  ASSERT_EQ(open.size(), 1u) << messages.All();
  EXPECT_EQ(open[0].line, 7);
}

TEST(VerilogBadInput, BinaryJunkGivesACappedNumberOfMessages) {
  MessageCapture messages;
  Project project;
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

TEST(VerilogBadInput, HugeTokensAreTakenWhole) {
  MessageCapture messages;
  Project project;
  const std::string name(4 << 20, 'n');
  std::vector<Module> modules = project.CompileText(
      "huge.v", "module " + name + "; initial $display(\"" + std::string(4 << 20, 's') + "\"); endmodule\n");
  ASSERT_EQ(modules.size(), 1u);
  EXPECT_EQ(modules[0].name, name);
  EXPECT_TRUE(messages.records().empty()) << messages.All();
}

TEST(VerilogBadInput, MissingEndmoduleAndStrayTokensDoNotLoseModules) {
  MessageCapture messages;
  Project project;
  std::vector<Module> modules = project.CompileText("structure.v",
                                                    "stray tokens here;\n"
                                                    "module a (x;\n"
                                                    "  cell u1 (.x(x);\n"
                                                    "module b; cell u2 (); end endmodule\n"
                                                    "endmodule\n"
                                                    "module c; cell u3 ()\n"
                                                    "  cell u4 ();\n"
                                                    "endmodule\n");
  ASSERT_EQ(NamesOf(modules), (Strings{"a", "b", "c"})) << messages.All();
  EXPECT_EQ(vci_test::InstanceNamesOf(modules[1]), Strings{"cell u2"});
  EXPECT_EQ(vci_test::InstanceNamesOf(modules[2]), (Strings{"cell u3", "cell u4"}));
  EXPECT_TRUE(messages.Has(vci_test::Format(Text::kExpectedModule, "stray"))) << messages.All();
  EXPECT_TRUE(messages.Has(vci_test::Format(Text::kMissingEndmodule, "a"))) << messages.All();
  EXPECT_TRUE(messages.Has(VerilogMessageLog::Format(Text::kUnbalanced, '(', ')'))) << messages.All();
  EXPECT_TRUE(messages.Has(Text::kEndmoduleWithoutModule)) << messages.All();
  EXPECT_TRUE(messages.Has(vci_test::Format(Text::kInstanceSeparatorExpected, "u3"))) << messages.All();
}

TEST(VerilogBadInput, DeclarationWithoutSemicolonIsReportedAtItsNameAndTheNextItemStillCounts) {
  MessageCapture messages;
  Project project;
  std::vector<Module> modules = project.CompileText("decl.v",
                                                    "module a;\n"
                                                    "  wire w\n"
                                                    "  cell u1 (.x(w));\n"
                                                    "  integer i\n"
                                                    "  initial i = 0;\n"
                                                    "  parameter P = 4\n"
                                                    "  localparam Q = 5;\n"
                                                    "  reg r\n"
                                                    "endmodule\n");
  ASSERT_EQ(NamesOf(modules), Strings{"a"}) << messages.All();
  EXPECT_EQ(vci_test::InstanceNamesOf(modules[0]), Strings{"cell u1"});
  std::vector<int> lines;
  for (const Port_MsgRecord& record : messages.records()) lines.push_back(record.line);
  EXPECT_EQ(lines, (std::vector<int>{2, 4, 6, 8})) << messages.All();
  EXPECT_TRUE(messages.Has(vci_test::Format(Text::kDeclarationWithoutSemicolon, "w"))) << messages.All();
  EXPECT_TRUE(messages.Has(vci_test::Format(Text::kDeclarationWithoutSemicolon, "4"))) << messages.All();
}

TEST(VerilogBadInput, CompleteDeclarationsOfEveryFormAreQuiet) {
  MessageCapture messages;
  Project project;
  std::vector<Module> modules =
      project.CompileText("decls.v",
                          "module a (input wire clk, output reg [3:0] q);\n"
                          "  wire (strong0, weak1) #(1, 2) w = f(clk), v;\n"
                          "  reg [7:0] mem [0:3];\n"
                          "  logic signed [3:0] s = int'(clk);\n"
                          "  input my_t port_a;\n"
                          "  parameter integer P = 4, Q = P + 1;\n"
                          "  localparam [3:0] A = {2'b01, 2'b10};\n"
                          "  genvar g;\n"
                          "  and g1 (w, clk, v);\n"
                          "  cell u1 (.x(w));\n"
                          "endmodule\n");
  ASSERT_EQ(NamesOf(modules), Strings{"a"});
  EXPECT_EQ(vci_test::InstanceNamesOf(modules[0]), Strings{"cell u1"});
  EXPECT_TRUE(messages.records().empty()) << messages.All();
}

TEST(VerilogBadInput, DeepNestingIsCutWithoutExhaustingTheStack) {
  MessageCapture messages;
  Project project;
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

TEST(VerilogBadInput, IncludeOfADirectoryCannotBeRead) {
  MessageCapture messages;
  Project project;
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

TEST(VerilogBadInput, RandomlyDamagedSourcesNeverBreakTheCompiler) {
  MessageCapture messages;
  Project project;
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
