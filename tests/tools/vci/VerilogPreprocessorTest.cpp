#include <gtest/gtest.h>

#include <algorithm>
#include <memory>
#include <string>
#include <vector>

#include "vci/VerilogMessageText.h"
#include "vci/VerilogPreprocessor.h"

namespace {

using Hx_Vci::VerilogMacroState;
using Hx_Vci::VerilogMacroTable;
using Hx_Vci::VerilogMessageLog;
using Hx_Vci::VerilogPreprocessedText;
using Hx_Vci::VerilogPreprocessor;
namespace Text = Hx_Vci::VerilogMessageText;

struct Preprocessed {
  std::string text;
  std::vector<std::string> messages;
};

Preprocessed Preprocess(const std::string& source, VerilogPreprocessor::Limits limits = {}) {
  VerilogMacroState macros(std::make_shared<VerilogMacroTable>());
  const std::vector<std::string> includeDirs;
  VerilogMessageLog log;
  VerilogPreprocessor preprocessor(macros, includeDirs, log, limits);
  Preprocessed result;
  result.text = preprocessor.Run("/src/file.v", source).text;
  for (const auto& message : log.messages()) {
    result.messages.push_back(std::to_string(message.line) + ": " + message.text);
  }
  return result;
}

// The text with runs of blanks made single, lines kept.
std::string Squeezed(const std::string& text) {
  std::string out;
  for (char c : text) {
    if (c == ' ' || c == '\t') {
      if (!out.empty() && out.back() != ' ' && out.back() != '\n') out.push_back(' ');
    } else {
      if (c == '\n' && !out.empty() && out.back() == ' ') out.pop_back();
      out.push_back(c);
    }
  }
  return out;
}

TEST(VerilogPreprocessor, ExpandsMacrosWithArgumentsNestedUsesPastingAndDefaults) {
  Preprocessed out = Preprocess(
      "`define W 8\n"
      "`define RANGE(msb, lsb) [msb:lsb]\n"
      "`define BUS(name, width) wire `RANGE(width-1, 0) name\n"
      "`define JOIN(a, b) a``_``b\n"
      "`define QUOTE(x) `\"x`\"\n"
      "`define OPT(a, b = two) a b\n"
      "`BUS(data, `W);\n"
      "`JOIN(top, core) `QUOTE(hello) `OPT(one) `OPT(1, 2)\n"
      "\"`W stays in a string\" // `W in a comment\n");
  EXPECT_TRUE(out.messages.empty());
  EXPECT_EQ(Squeezed(out.text),
            "\n\n\n\n\n\n"
            "wire [8-1:0] data;\n"
            "top_core \"hello\" one two 1 2\n"
            "\"`W stays in a string\"\n");
}

TEST(VerilogPreprocessor, KeepsEveryLineBreakOfTheSource) {
  const std::string source =
      "`define LONG(a, \\\n"
      "             b) a + \\\n"
      "                b\n"
      "/* a comment\n"
      "   over lines */ x = `LONG(1,\n"
      "                         2);\n"
      "`ifdef NOT_DEFINED\n"
      "  skipped\n"
      "`endif\n"
      "`undef LONG\n"
      "`timescale 1ns/1ps\n"
      "line_`__LINE__ `__FILE__\n";
  Preprocessed out = Preprocess(source);
  EXPECT_TRUE(out.messages.empty());
  EXPECT_EQ(std::count(out.text.begin(), out.text.end(), '\n'),
            std::count(source.begin(), source.end(), '\n'));
  EXPECT_EQ(Squeezed(out.text), "\n\n\n\nx = 1 + 2\n;\n\n\n\n\n\nline_12 \"/src/file.v\"\n")
      << "the line break inside the macro call follows its expansion";
}

TEST(VerilogPreprocessor, ExplodingMacrosAreCutAtTheirLimits) {
  std::string source;
  for (int i = 0; i < 30; ++i) {
    source += "`define E" + std::to_string(i) + " `E" + std::to_string(i + 1) + " `E" +
              std::to_string(i + 1) + "\n";
  }
  source += "`define E30 x\n`E0\n`E0\nafter\n";
  VerilogPreprocessor::Limits limits;
  limits.macroExpansionBytes = 4096;
  limits.expansionBudget = 6000;
  Preprocessed out = Preprocess(source, limits);
  ASSERT_EQ(out.messages.size(), 2u);
  bool tooLarge = false;
  for (int i = 0; i <= 30; ++i) {
    const std::string name = "E" + std::to_string(i);
    tooLarge |= out.messages[0] == "32: " + VerilogMessageLog::Format(Text::kMacroTooLarge, name.c_str(),
                                                                      limits.macroExpansionBytes);
  }
  EXPECT_TRUE(tooLarge) << out.messages[0];
  EXPECT_EQ(out.messages[1],
            "33: " + VerilogMessageLog::Format(Text::kExpansionBudgetSpent, limits.expansionBudget));
  EXPECT_NE(out.text.find("after"), std::string::npos);
}

TEST(VerilogPreprocessor, ReportsMisusedMacrosAndDirectives) {
  Preprocessed out = Preprocess(
      "`define F(a) a\n"
      "`F\n"
      "`F(1, 2)\n"
      "`define\n"
      "`define ifdef 1\n"
      "`define BAD(a b) x\n"
      "`undef\n"
      "` stray\n"
      "`F(open\n");
  EXPECT_EQ(out.messages, (std::vector<std::string>{
                              "2: " + VerilogMessageLog::Format(Text::kMacroNeedsArguments, "F"),
                              "3: " + VerilogMessageLog::Format(Text::kTooManyMacroArguments, "F",
                                                                std::size_t{1}, std::size_t{2}),
                              "4: " + std::string(Text::kDefineWithoutName),
                              "5: " + VerilogMessageLog::Format(Text::kDirectiveRedefined, "ifdef"),
                              "6: " + VerilogMessageLog::Format(Text::kBadMacroParameters, "BAD"),
                              "7: " + VerilogMessageLog::Format(Text::kDirectiveNeedsName, "undef"),
                              "8: " + std::string(Text::kStrayBacktick),
                              "9: " + VerilogMessageLog::Format(Text::kUnterminatedMacroArguments, "F"),
                          }));
}

}  // namespace
