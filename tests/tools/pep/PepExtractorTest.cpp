#include <gtest/gtest.h>

#include <fstream>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "ScopedTempDir.h"
#include "SeededRandom.h"
#include "pep/PepExpressionEvaluator.h"
#include "pep/PepExtractor.h"
#include "pep/PepVerilogLexer.h"
#include "pep/PepVhdlLexer.h"
#include "pep/Pep_Exception.h"

namespace {

using Ports = std::vector<std::string>;

// "name type direction", then "[left:right]" with a range; "?[left:right]" for bounds without one.
Ports Described(const std::vector<PepPort>& ports) {
  static const char* const kDirections[] = {"in", "out", "inout"};
  Ports described;
  for (const PepPort& port : ports) {
    std::string text = port.name + " " + port.typeName + " ";
    text += port.direction >= 0 && port.direction < 3 ? kDirections[port.direction] : "?";
    if (port.hasRange || port.left || port.right) {
      text +=
          (port.hasRange ? " [" : " ?[") + std::to_string(port.left) + ":" + std::to_string(port.right) + "]";
    }
    described.push_back(text);
  }
  return described;
}

template <class Exception, class Call>
std::string MessageThrownBy(Call call) {
  try {
    call();
  } catch (const Exception& e) {
    return e.what();
  }
  return "(nothing thrown)";
}

// Writes the sources to a temporary directory, parses them in the order given and finds the top.
class PortExtractorTest : public testing::Test {
 protected:
  void Add(const std::string& fileName, const std::string& text, int language) {
    std::ofstream(dir_.Path(fileName), std::ios::binary) << text;
    extractor_->addDesignFile("work", dir_.Path(fileName).c_str(), language);
  }
  // The ports of the unit `name` (of the top with "topmodule").
  Ports PortsOf(const char* name) {
    const int search =
        std::string(name) == "topmodule" ? PepExtractor::kSearchTop : PepExtractor::kSearchExactName;
    EXPECT_EQ(extractor_->findDesignUnit("work", name, search), PepExtractor::kUnitFound) << name;
    return Described(extractor_->getPorts());
  }
  // A fresh extractor on `text` alone: the ports of its top, and whether all generics are defined.
  Ports TopPortsOf(const std::string& fileName, const std::string& text, int language,
                   bool allDefined = true) {
    extractor_ = std::make_unique<PepExtractor>();
    Add(fileName, text, language);
    extractor_->Parse(PepExtractor::kVerilog);
    Ports ports = PortsOf("topmodule");
    EXPECT_EQ(extractor_->hasAllGenericsDefined(), allDefined) << text;
    return ports;
  }

  ScopedTempDir dir_;
  std::unique_ptr<PepExtractor> extractor_ = std::make_unique<PepExtractor>();
};

std::optional<std::int32_t> Evaluate(const std::string& text, PepLanguage language) {
  PepTokens tokens;
  std::unique_ptr<PepLexer> lexer;
  if (language == PepLanguage::kVhdl) {
    lexer = std::make_unique<PepVhdlLexer>(text);
  } else {
    lexer = std::make_unique<PepVerilogLexer>(text);
  }
  for (PepToken token = lexer->Next(); !token.IsEnd(); token = lexer->Next()) tokens.push_back(token);
  PepExpressionEvaluator evaluator(language, [](const std::string& key) -> std::optional<std::int64_t> {
    if (key == "w") return 8;
    if (key == "W") return 16;
    return std::nullopt;
  });
  return evaluator.Evaluate(tokens);
}

}  // namespace

TEST_F(PortExtractorTest, PortsOfTheTopWithDirectionsTypesAndRangesFromTheDefaults) {
  EXPECT_EQ(TopPortsOf("unit.vhd", R"(
library ieee; use ieee.std_logic_1164.all;
-- entity decoy is port (x : in bit); end;
/* entity other_decoy is port (y : in bit); end; */
ENTITY Shifter IS
  Generic (Width : Integer := 8;   -- a comment ; with ( a bracket
           constant DEPTH : natural := width * 2;
           LABEL_TEXT : string := "port (z : in bit);";
           FAST : boolean := true);
  PORT (Clk, rst : IN std_logic;
        data_a, data_b : in std_logic_vector(WIDTH - 1 downto 0);
        q : out unsigned(0 to depth-1);
        signal flag : buffer bit;
        link : linkage bit;
        bus_io : inout std_logic_vector(16#F# downto 2**2);
        count : out integer range 0 to 15;
        level : natural range width downto 1 := 3;
        plain : bit_vector(7 downto 0));
end entity Shifter;
architecture rtl of shifter is begin end;
)",
                       PepExtractor::kVhdl),
            (Ports{"Clk std_logic in", "rst std_logic in", "data_a std_logic_vector in [7:0]",
                   "data_b std_logic_vector in [7:0]", "q unsigned out [0:15]", "flag bit out",
                   "link bit inout", "bus_io std_logic_vector inout [15:4]", "count integer out [0:15]",
                   "level natural in [8:1]", "plain bit_vector in [7:0]"}));
  // ANSI ports carry direction, type and range on to the next name.
  EXPECT_EQ(TopPortsOf("ansi.v", R"(
`timescale 1ns/1ps
`define UNUSED_WIDTH 12
// module decoy(input x);
(* keep = "true" *)
module Mixer #(parameter W = 8, D = W * 2, parameter real GAIN = 1.5, parameter NAME = "mix")
  (input wire [W-1:0] a, b,
   output reg signed [D-1:0] q,
   inout [8'h0F:4'b0010] pads,
   input logic clk,
   input rst_n, \odd.name ,
   output [`UNUSED_WIDTH-1:0] wide);
  localparam HALF = D / 2;
  always @(*) q = a * b; /* endmodule */
endmodule
)",
                       PepExtractor::kVerilog),
            (Ports{"a wire in [7:0]", "b wire in [7:0]", "q reg out [15:0]", "pads wire inout [15:2]",
                   "clk logic in", "rst_n wire in", "odd.name wire in", "wide wire out"}));
  // Non-ANSI ports keep the header order and take the body declarations.
  EXPECT_EQ(TopPortsOf("classic.v", R"(
module counter(clk, value, carry, spare);
  parameter WIDTH = 4;
  localparam TOP = WIDTH + 1;
  localparam LOG = $clog2(WIDTH);  // a localparam without a value does not count
  input clk;
  output [WIDTH-1:0] value;
  output carry;
  reg [TOP:0] carry;
  reg [3:0] value;
  function [3:0] next; input [3:0] clk; next = clk + 1; endfunction
endmodule
)",
                       PepExtractor::kVerilog),
            (Ports{"clk wire in", "value reg out [3:0]", "carry reg out [5:0]", "spare wire inout"}));
  // A generic without a usable default is undefined and the ranges using it are not computed.
  EXPECT_EQ(TopPortsOf("open.vhd", R"(
entity open_width is
  generic (W : integer; MODE : boolean := false);
  port (d : in std_logic_vector(W - 1 downto 0); e : in bit_vector(3 downto 0));
end;
)",
                       PepExtractor::kVhdl, false),
            (Ports{"d std_logic_vector in", "e bit_vector in [3:0]"}));
  // C has a default, though not one the extractor computes.
  EXPECT_EQ(TopPortsOf("calls.v",
                       "module calls #(parameter N = 16, B = $clog2(N), C = $bits(N)) (input [B-1:0] sel);\n"
                       "endmodule\n",
                       PepExtractor::kVerilog),
            Ports{"sel wire in [3:0]"});
  // Defaults that cannot be computed leave only the ports that use them without range.
  EXPECT_EQ(TopPortsOf("cpu.v", R"(
`define XLEN 32
module cpu #(parameter RESET_VECTOR = {16'h0, 16'h100}, WIDTH = `XLEN, DEPTH = 4,
             parameter [7:0] MODE = "A")
  (input clk,
   input [DEPTH-1:0] irq,
   output [WIDTH-1:0] addr,
   output [$clog2(DEPTH):0] level);
endmodule
)",
                       PepExtractor::kVerilog),
            (Ports{"clk wire in", "irq wire in [3:0]", "addr wire out", "level wire out [2:0]"}));
  // Ranges that cannot be evaluated leave the port without range; HUGE does not fit 32 bits but has
  // a default.
  EXPECT_EQ(TopPortsOf("odd.v", R"(
`define WIDTH 8
module odd #(parameter ZERO = 0, HUGE = 2 ** 40, P = 1)
  (input [`WIDTH-1:0] by_macro,
   input [8 / ZERO : 0] by_zero,
   input [HUGE : 0] too_big,
   input [UNKNOWN : 0] unknown,
   input [P ? 3 : 1 : 0] conditional,
   input [P > 0 ? UNKNOWN : 1 : 0] unknown_branch,
   input [2147483647 : -2147483648] widest);
endmodule
)",
                       PepExtractor::kVerilog),
            (Ports{"by_macro wire in", "by_zero wire in", "too_big wire in", "unknown wire in",
                   "conditional wire in [3:0]", "unknown_branch wire in",
                   "widest wire in [2147483647:-2147483648]"}));
}

TEST_F(PortExtractorTest, TopIsTheLastUnitThatNoOtherUnitInstantiates) {
  const std::string leaves = R"(
entity leaf is port (a : in bit); end;
entity Leaf2 is port (b : in bit); end;
entity mid is port (d : in bit); end;
architecture rtl of mid is
  component leaf port (a : in bit); end component;
  signal s : bit;
begin
  u1 : leaf port map (a => d);
  u2 : entity work.LEAF2(rtl) port map (b => d);
end;
entity recursive is generic (N : natural := 2); port (c : in bit); end;
architecture rtl of recursive is begin
  deeper : if N > 0 generate inner : entity work.recursive generic map (N => N - 1) port map (c => c); end generate;
end;
)";
  EXPECT_EQ(TopPortsOf("leaves.vhd", leaves, PepExtractor::kVhdl), Ports{"c bit in"});

  extractor_ = std::make_unique<PepExtractor>();
  Add("leaves.vhd", leaves, PepExtractor::kVhdl);
  Add("upper.v", R"(
module lonely(input x); endmodule
module chip(input y);
  MID #(.unused(1)) core (.d(y));
  recursive spare_copy [1:0] (.c(y));
endmodule
module harness; chip inner(.y(1'b0)); endmodule
module chip_tb(input t); endmodule
)",
      PepExtractor::kVerilog);
  extractor_->Parse(PepExtractor::kVerilog);
  EXPECT_EQ(PortsOf("topmodule"), Ports{"t wire in"});
  EXPECT_EQ(extractor_->findDesignUnit("WORK", "ignored", PepExtractor::kSearchTop), PepExtractor::kUnitFound)
      << "the library compares in any letter case";

  EXPECT_EQ(PortsOf("LEAF"), Ports{"a bit in"});
  EXPECT_EQ(PortsOf("lonely"), Ports{"x wire in"});
  EXPECT_TRUE(extractor_->hasAllGenericsDefined());

  EXPECT_EQ(extractor_->findDesignUnit("work", "LONELY", PepExtractor::kSearchExactName),
            PepExtractor::kUnitNotFound)
      << "Verilog names keep their letter case";
  EXPECT_TRUE(extractor_->getPorts().empty());
  EXPECT_FALSE(extractor_->hasAllGenericsDefined());
  EXPECT_EQ(extractor_->findDesignUnit("other", "leaf", PepExtractor::kSearchExactName),
            PepExtractor::kUnitNotFound);
  EXPECT_EQ(extractor_->findDesignUnit("work", "leaf", 7), PepExtractor::kUnitNotFound);
}

TEST_F(PortExtractorTest, ConfigurationBindingsConditionalTextAndEscapedNamesAreFollowed) {
  EXPECT_EQ(TopPortsOf("bound.vhd", R"(
entity impl is port (p : in bit); end;
entity shell is port (q : in bit); end;
architecture rtl of shell is
  component comp port (p : in bit); end component;
  for u : comp use entity work.impl;
begin
  u : comp port map (p => q);
end;
)",
                       PepExtractor::kVhdl),
            Ports{"q bit in"});
  EXPECT_EQ(TopPortsOf("cond.v", R"(
`ifdef FAST
module picker(input [3:0] a);
`else
module picker(input [7:0] a);
`endif
  wire [7:0] s = "endmodule /* not a comment";
endmodule
module \top$ (input b); picker p(.a(b)); endmodule
)",
                       PepExtractor::kVerilog),
            Ports{"b wire in"});
  EXPECT_EQ(PortsOf("top$"), Ports{"b wire in"});
  // Both branches of the `ifdef are read; the later module of the same name wins.
  EXPECT_EQ(PortsOf("picker"), Ports{"a wire in [7:0]"});
}

TEST(PortExtractorExpressions, VhdlLiteralsAndOperators) {
  EXPECT_EQ(Evaluate("16#FF# + 2#1010_1010# + 8#17#", PepLanguage::kVhdl), 255 + 170 + 15);
  EXPECT_EQ(Evaluate("1E3 + 16#F#E1 + 1_000", PepLanguage::kVhdl), 1000 + 240 + 1000);
  EXPECT_EQ(Evaluate("7 mod -3", PepLanguage::kVhdl), -2);
  EXPECT_EQ(Evaluate("-7 mod 3", PepLanguage::kVhdl), 2);
  EXPECT_EQ(Evaluate("-7 REM 3", PepLanguage::kVhdl), -1);
  EXPECT_EQ(Evaluate("-2 ** 2 + abs (-5)", PepLanguage::kVhdl), -4 + 5);
  EXPECT_EQ(Evaluate("(W + 1) * 2 / 3", PepLanguage::kVhdl), 6) << "names are looked up in lower case";
  EXPECT_EQ(Evaluate("2 ** 31 - 1", PepLanguage::kVhdl), 2147483647);
  for (const char* unevaluable :
       {"2 ** 31", "1.5", "1E-2", "x'length", "f(3)", "1 / 0", "(3", "3 3", "\"10\"",
        "9223372036854775807 + 1", "2 ** 63", "-(-9223372036854775807 - 1)", "1 % 2"}) {
    EXPECT_EQ(Evaluate(unevaluable, PepLanguage::kVhdl), std::nullopt) << unevaluable;
  }
  std::string deep = std::string(PepExpressionEvaluator::kMaxDepth + 1, '(') + "1" +
                     std::string(PepExpressionEvaluator::kMaxDepth + 1, ')');
  EXPECT_EQ(Evaluate(deep, PepLanguage::kVhdl), std::nullopt);
  std::string shallow = std::string(40, '(') + "1" + std::string(40, ')');
  EXPECT_EQ(Evaluate(shallow, PepLanguage::kVhdl), 1);
}

TEST(PortExtractorExpressions, VerilogLiteralsAndOperators) {
  EXPECT_EQ(Evaluate("8'hFF + 4'b1010 + 'd10 + 8 'h 1_0 + 4'sb0011", PepLanguage::kVerilog),
            255 + 10 + 10 + 16 + 3);
  EXPECT_EQ(Evaluate("4'hFF", PepLanguage::kVerilog), 15) << "the size cuts the value";
  EXPECT_EQ(Evaluate("-7 % 3 + W", PepLanguage::kVerilog), -1 + 16) << "names keep their letter case";
  EXPECT_EQ(Evaluate("W / 3 * 3", PepLanguage::kVerilog), 15);
  EXPECT_EQ(Evaluate("$clog2(W) + $clog2(1) + $clog2(0) + $clog2(17)", PepLanguage::kVerilog), 4 + 0 + 0 + 5);
  EXPECT_EQ(Evaluate("(1 << W / 4) - (-16 >> 2) + (W >= 16 && W != 0 || 0)", PepLanguage::kVerilog),
            16 + 4 + 1);
  EXPECT_EQ(Evaluate("W > 8 ? W - 1 : W < 4 ? 3 : 7", PepLanguage::kVerilog), 15);
  for (const char* unevaluable : {"4'b1x00", "1.0e3", "`W", "$clog2(-1)", "$bits(W)", "7 mod 2", "1 << 63",
                                  "1 << -1", "W ? 1", "W ? 1 : 2 : 3", "'1"}) {
    EXPECT_EQ(Evaluate(unevaluable, PepLanguage::kVerilog), std::nullopt) << unevaluable;
  }
}

TEST_F(PortExtractorTest, BadInputNeverCrashesAndReadsWhatItCan) {
  SeededRandom random(20240611);
  Add("junk.vhd", random.Bytes(64 * 1024), PepExtractor::kVhdl);
  Add("junk.v", random.Bytes(64 * 1024), PepExtractor::kVerilog);
  Add("deep.vhd",
      "entity deep is port (a : in bit_vector(" + std::string(100000, '(') + "7" + std::string(100000, ')') +
          " downto 0); b : in bit);\nend;",
      PepExtractor::kVhdl);
  Add("deep.v", "module deep_v #(parameter P = " + std::string(100000, '(') + "1) (input [P:0] q);",
      PepExtractor::kVerilog);
  Add("huge_name.vhd", "entity " + std::string(1 << 20, 'n') + " is port (a : in bit);", PepExtractor::kVhdl);
  Add("unterminated.vhd",
      "entity strings is port (s : in string := \"open\n; t : in bit); end;\n/* open comment\n"
      "entity hidden is port (h : in bit); end;",
      PepExtractor::kVhdl);
  Add("unterminated.v", "module tail(input a, output b); /* entity\nmodule hidden(input h); endmodule\n",
      PepExtractor::kVerilog);
  Add("truncated.v", "module", PepExtractor::kVerilog);
  ASSERT_NO_THROW(extractor_->Parse(PepExtractor::kVerilog));

  EXPECT_EQ(PortsOf("deep"), (Ports{"a bit_vector in", "b bit in"}));
  EXPECT_EQ(PortsOf("deep_v"), Ports{}) << "the unclosed default takes the port list with it";
  EXPECT_EQ(PortsOf("strings"), (Ports{"s string in", "t bit in"}));
  EXPECT_EQ(extractor_->findDesignUnit("work", "hidden", PepExtractor::kSearchExactName),
            PepExtractor::kUnitNotFound);
  EXPECT_EQ(PortsOf("tail"), (Ports{"a wire in", "b wire out"}));
  EXPECT_EQ(extractor_->findDesignUnit("work", std::string(PepToken::kMaxTextLength, 'n').c_str(),
                                       PepExtractor::kSearchExactName),
            PepExtractor::kUnitFound)
      << "over-long names are cut";
}

TEST(PortExtractor, RejectsDesignFilesItCannotRead) {
  PepExtractor extractor;
  EXPECT_THROW(extractor.addDesignFile("work", "/src/top.vhd", 2), Pep_Exception::Base);
  EXPECT_THROW(extractor.addDesignFile("work", nullptr, PepExtractor::kVhdl), Pep_Exception::Base);
  EXPECT_THROW(extractor.addDesignFile(nullptr, "/src/top.vhd", PepExtractor::kVhdl), Pep_Exception::Base);
  EXPECT_EQ(MessageThrownBy<Pep_Exception::Base>([&] { extractor.Parse(PepExtractor::kVhdl); }),
            PepExtractor::kNoFilesMessage);
  EXPECT_NE(extractor.findDesignUnit("work", "topmodule", PepExtractor::kSearchTop),
            PepExtractor::kUnitFound);

  ScopedTempDir dir;
  const std::string missing = dir.Path("missing.vhd");
  extractor.addDesignFile("work", missing.c_str(), PepExtractor::kVhdl);
  EXPECT_EQ(MessageThrownBy<Pep_Exception::Base>([&] { extractor.Parse(PepExtractor::kVhdl); }),
            PepExtractor::kUnreadableFileMessage + missing);

  PepExtractor directory;
  directory.addDesignFile("work", dir.path().c_str(), PepExtractor::kVerilog);
  EXPECT_EQ(MessageThrownBy<Pep_Exception::Base>([&] { directory.Parse(PepExtractor::kVerilog); }),
            PepExtractor::kUnreadableFileMessage + dir.path());
  EXPECT_FALSE(directory.hasAllGenericsDefined());
  EXPECT_TRUE(directory.getPorts().empty());
}
