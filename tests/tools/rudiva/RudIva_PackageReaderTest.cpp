#include <gtest/gtest.h>

#include <algorithm>
#include <istream>
#include <sstream>
#include <streambuf>
#include <string>
#include <vector>

#include "rudiva/RudIva_Lexer.h"
#include "rudiva/RudIva_PackageReader.h"

namespace {

using Components = std::vector<std::string>;

Components ComponentsOf(const std::string& text, const std::string& unit = "vcomponents") {
  std::istringstream in(text);
  auto package = RudIva_PackageReader::Read(in, unit);
  EXPECT_TRUE(package) << "no package " << unit;
  return package ? package->components : Components{};
}

bool Declares(const std::string& text, const std::string& unit) {
  std::istringstream in(text);
  return RudIva_PackageReader::Read(in, unit).has_value();
}

// Serves `prefix`, then `fillerSize` bytes of `filler` repeated, then `suffix`, without holding the
// filler in memory.
class GeneratedText : public std::streambuf {
 public:
  GeneratedText(std::string prefix, char filler, std::size_t fillerSize, std::string suffix)
      : prefix_(std::move(prefix)), suffix_(std::move(suffix)), filler_(filler), fillerLeft_(fillerSize) {}

 protected:
  int_type underflow() override {
    if (part_ == 0) {
      part_ = 1;
      return Serve(prefix_);
    }
    if (fillerLeft_ > 0) {
      chunk_.assign(std::min<std::size_t>(fillerLeft_, 1 << 16), filler_);
      fillerLeft_ -= chunk_.size();
      return Serve(chunk_);
    }
    if (part_ == 1) {
      part_ = 2;
      return Serve(suffix_);
    }
    return traits_type::eof();
  }

 private:
  int_type Serve(std::string& text) {
    if (text.empty()) return underflow();
    setg(text.data(), text.data(), text.data() + text.size());
    return traits_type::to_int_type(text[0]);
  }

  std::string prefix_, suffix_, chunk_;
  char filler_;
  std::size_t fillerLeft_;
  int part_ = 0;
};

}  // namespace

TEST(PackageReader, ListsTheComponentsOfThePackageOnly) {
  // With or without "is" and closing name.
  EXPECT_EQ(ComponentsOf(R"(
    library ieee; use ieee.std_logic_1164.all;
    package vcomponents is
      component QL_AND2 is port (A, B : in std_logic; Y : out std_logic); end component;
      component QL_OR2 port (A, B : in std_logic; Y : out std_logic); end component QL_OR2;
      COMPONENT Ql_Dff IS GENERIC (INIT : BIT := '0'); PORT (D, CLK : IN STD_LOGIC; Q : OUT STD_LOGIC);
      End Component Ql_Dff ;
      component \odd cell\ port (x : in bit); end component \odd cell\;
      component bare end component;
    end package vcomponents;
    component AFTER_THE_END port (x : in bit); end component;)"),
            (Components{"QL_AND2", "QL_OR2", "Ql_Dff", "\\odd cell\\", "bare"}));
  // Not in comments, strings or character literals.
  EXPECT_EQ(ComponentsOf(R"(
    package vcomponents is
      -- component IN_LINE_COMMENT port (x : in bit); end component;
      /* component IN_BLOCK_COMMENT port (x : in bit);
         end component; */
      constant note : string := "component IN_STRING is end component; "" still a string";
      constant semicolon : character := ';';
      constant open_paren : character := '(';
      component REAL_ONE
        generic (SEP : character := ')'; QUOTE : character := '"'; TEXT : string := "end component;");
        port (y : out bit);
      end component;
    end;)"),
            (Components{"REAL_ONE"}));
  // Nested parentheses, ticks and qualified expressions.
  EXPECT_EQ(ComponentsOf(R"(
    package vcomponents is
      component QL_WIDE
        generic (W : positive := 4; INIT : std_logic_vector(7 downto 0) := std_logic_vector'(X"0F"));
        port (D : in std_logic_vector((W * 2) - 1 downto 0);
              Q : out std_logic_vector(D'high downto ((D'low))));
      end component;
      component QL_AFTER port (Q : out bit := bit'('1')); end component;
    end package;)"),
            (Components{"QL_WIDE", "QL_AFTER"}));
  // Other declarations holding semicolons or ends.
  EXPECT_EQ(ComponentsOf(R"(
    package vcomponents is
      type pair is record low : integer; high : integer; end record pair;
      type distance is range 0 to 1000 units um; mm = 1000 um; end units distance;
      type counter is protected procedure step(by : integer; wrap : boolean); end protected counter;
      function width(a : bit_vector; b : integer) return natural;
      attribute black_box : boolean;
      attribute black_box of QL_A : component is true;
      component QL_A port (x : in bit); end component;
      package inner is component NESTED port (x : in bit); end component; end package inner;
      package numbers is new work.generic_numbers generic map (size => 8);
      alias QL_ALIAS is QL_A;
      component QL_B port (x : in bit); end component;
    end package vcomponents;)"),
            (Components{"QL_A", "QL_B"}));
}

TEST(PackageReader, FindsTheDeclarationByNameIgnoringCase) {
  const std::string text = R"(
    package body vcomponents is function f return integer is begin return 1; end; end package body;
    package other is component WRONG port (x : in bit); end component; end package;
    package vcomponents is new work.template;
    PACKAGE VComponents IS component RIGHT port (x : in bit); end component; END;
    package \Odd Name\ is component ODD port (x : in bit); end component; end;)";
  std::istringstream in(text);
  auto package = RudIva_PackageReader::Read(in, "vcomponents");
  ASSERT_TRUE(package);
  EXPECT_EQ(package->name, "VComponents");
  EXPECT_EQ(package->components, Components{"RIGHT"});

  EXPECT_EQ(ComponentsOf(text, "\\Odd Name\\"), Components{"ODD"});
  EXPECT_FALSE(Declares(text, "\\odd name\\")) << "extended identifiers are case-sensitive";
  EXPECT_FALSE(Declares(text, "body"));
  EXPECT_FALSE(Declares(text, "missing"));
  EXPECT_FALSE(Declares("", "vcomponents"));
  EXPECT_FALSE(Declares("-- package vcomponents is", "vcomponents"));
}

TEST(PackageReader, KeepsGoingAfterBrokenDeclarationsAndBinaryJunk) {
  EXPECT_EQ(ComponentsOf(R"(
    package vcomponents is
      component NEVER_CLOSED port (x : in bit);
      component CLOSED port (x : in bit)); ) end component;
      constant missing_semicolon : integer := 1
      component ; end component;
      component AFTER_JUNK port (x : in bit); end component;
    end;)"),
            (Components{"CLOSED", "AFTER_JUNK"}));
  EXPECT_EQ(ComponentsOf("package vcomponents is component CUT port (x : in bit); end"), Components{});
  EXPECT_EQ(ComponentsOf("package vcomponents is component OPEN port (x : \"in bit); end component;"),
            Components{})
      << "an unterminated string runs to the end of its line";
  EXPECT_EQ(ComponentsOf("package vcomponents is component A port(x:in bit);end component; /* end;"),
            Components{"A"});
  // Binary junk.
  std::string junk;
  for (int i = 0; i < 5000; ++i) junk.push_back(static_cast<char>((i * 7919) % 256));
  junk += std::string("\0\0(\\\"'", 6);
  EXPECT_FALSE(Declares(junk, "vcomponents"));
  EXPECT_TRUE(Declares("package vcomponents is " + junk, "vcomponents"));
  EXPECT_EQ(
      ComponentsOf(junk + "\npackage vcomponents is component Z port (q : out bit); end component; end;"),
      Components{"Z"})
      << "strings and extended identifiers left open by the junk end at its line";
}

TEST(PackageReader, ReadsHugeTextsInBoundedPieces) {
  GeneratedText longIdentifier(
      "library ", 'a', 8u << 20,
      "; package vcomponents is component QL_X port (x : in bit); end component; end;");
  std::istream in(&longIdentifier);
  auto package = RudIva_PackageReader::Read(in, "vcomponents");
  ASSERT_TRUE(package);
  EXPECT_EQ(package->components, Components{"QL_X"});

  GeneratedText endlessComment("package vcomponents is /*", 'c', 8u << 20, "");
  std::istream commentIn(&endlessComment);
  auto unterminated = RudIva_PackageReader::Read(commentIn, "vcomponents");
  ASSERT_TRUE(unterminated);
  EXPECT_TRUE(unterminated->components.empty());
}

TEST(Lexer, CutsOverLongTokensAndTellsTicksFromCharacterLiterals) {
  std::istringstream in(std::string(3000, 'x') + " s'length f(')') := ''' x'('1')");
  RudIva_Lexer lexer(in);
  RudIva_Lexer::Token longName = lexer.Next();
  EXPECT_EQ(longName.text.size(), RudIva_Lexer::kMaxTokenLength);
  std::vector<std::string> texts;
  for (RudIva_Lexer::Token token = lexer.Next(); token.kind != RudIva_Lexer::Kind::kEnd;
       token = lexer.Next()) {
    texts.push_back(token.text);
  }
  EXPECT_EQ(texts, (std::vector<std::string>{"s", "'", "length", "f", "(", "')'", ")", ":", "=", "'''", "x",
                                             "'", "(", "'1'", ")"}));
}
