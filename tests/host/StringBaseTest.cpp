#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Port/Memory.h"
#include "Port/StringBase.h"

using Port::StringBase;

namespace {

std::vector<std::string> Texts(const std::vector<StringBase>& pieces) {
  std::vector<std::string> texts;
  for (const StringBase& piece : pieces) texts.push_back(piece.str());
  return texts;
}

std::vector<std::string> SplitTexts(const char* text, const char* delimiters, bool keepEmpty,
                                    const char* openQuote = "", const char* closeQuote = "") {
  std::vector<StringBase> pieces{"left over"};
  std::size_t count = StringBase(text).Split(pieces, delimiters, keepEmpty, openQuote, closeQuote);
  EXPECT_EQ(count, pieces.size());
  return Texts(pieces);
}

using Pieces = std::vector<std::string>;

}  // namespace

TEST(StringBase, FormatProducesTextOfAnyLength) {
  std::string longArgument(5000, 'x');
  StringBase text("old");
  text.Format("<%s|%d>", longArgument.c_str(), 42);
  EXPECT_EQ(text.str(), "<" + longArgument + "|42>");

  text.AppendFormat("%05.1f%c", 3.5, '!');
  EXPECT_EQ(text.Right(10).str(), "|42>003.5!");
  EXPECT_EQ(text.Length(), longArgument.size() + 5 + 6);
}

TEST(StringBase, FormatMayReadItsOwnText) {
  StringBase text("abc");
  text.Format("%s-%s", text.c_str(), text.c_str());
  EXPECT_EQ(text, "abc-abc");
  text.AppendFormat("+%s", text.c_str());
  EXPECT_EQ(text, "abc-abc+abc-abc");
}

TEST(StringBase, ComparesUnsignedBytesExactlyOrFoldingAsciiLetters) {
  StringBase abc("ABC");
  EXPECT_LT(abc.Compare("abc"), 0);
  EXPECT_GT(StringBase("abc").Compare("ABC"), 0);
  EXPECT_EQ(abc.Compare("ABC"), 0);
  EXPECT_LT(abc.Compare("ABCD"), 0);
  EXPECT_GT(abc.Compare("AB"), 0);
  // Bytes above 127 sort after ASCII, as unsigned bytes.
  EXPECT_GT(StringBase("\xE9").Compare("z"), 0);
  EXPECT_LT(StringBase("z").Compare("\xE9"), 0);
  EXPECT_EQ(StringBase("ABC").Compare("abc", Port::kCompareNoCase), 0);
  EXPECT_TRUE(StringBase("Std_Logic").Equals("STD_LOGIC", 1));
  EXPECT_LT(StringBase("abc").Compare("ABD", 1), 0);
  EXPECT_GT(StringBase("abcd").Compare("ABC", 1), 0);
  // '_' lies between the upper and lower case letters: folding to lower case puts it first.
  EXPECT_LT(StringBase("_").Compare("A", 1), 0);
  // Non-ASCII bytes are compared unchanged and as unsigned.
  EXPECT_NE(StringBase("\xC9").Compare("\xE9", 1), 0);
  EXPECT_GT(StringBase("\xE9").Compare("Z", 1), 0);
  EXPECT_EQ(StringBase("\xE9X").Compare("\xE9x", 1), 0);
  EXPECT_EQ(Port::stricmp("Entity", "ENTITY"), 0);
  EXPECT_LT(Port::stricmp("entity", "ENTITYX"), 0);
  EXPECT_GT(Port::stricmp("b", "A"), 0);
  EXPECT_EQ(Port::stricmp(nullptr, nullptr), 0);
  EXPECT_LT(Port::stricmp(nullptr, ""), 0);
  EXPECT_GT(Port::stricmp("", nullptr), 0);
}

TEST(StringBase, StrdupCopiesIntoSharedHeap) {
  EXPECT_EQ(Port::strdup(nullptr), nullptr);
  char* copy = Port::strdup("work.cpu");
  ASSERT_NE(copy, nullptr);
  EXPECT_STREQ(copy, "work.cpu");
  copy = static_cast<char*>(cvn_realloc(copy, 64));
  ASSERT_NE(copy, nullptr);
  EXPECT_STREQ(copy, "work.cpu");
  cvn_free(copy);
}

TEST(StringBase, SplitKeepsOrDropsEmptyPiecesAndQuotedPiecesWhole) {
  EXPECT_EQ(SplitTexts("ieee.std_logic_1164.all", ".", false, "\"", "\""),
            (Pieces{"ieee", "std_logic_1164", "all"}));
  EXPECT_EQ(SplitTexts("work", ".", false, "\"", "\""), (Pieces{"work"}));
  EXPECT_EQ(SplitTexts(".a..b.", ".", true), (Pieces{"", "a", "", "b", ""}));
  EXPECT_EQ(SplitTexts(".a..b.", ".", false), (Pieces{"a", "b"}));
  EXPECT_EQ(SplitTexts("", ".", true), (Pieces{""}));
  EXPECT_EQ(SplitTexts("", ".", false), (Pieces{}));
  EXPECT_EQ(SplitTexts("a b,c", " ,", false), (Pieces{"a", "b", "c"}));
  EXPECT_EQ(SplitTexts("a.b", "", false), (Pieces{"a.b"}));
  EXPECT_EQ(SplitTexts("lib.\"odd.name\".all", ".", false, "\"", "\""),
            (Pieces{"lib", "\"odd.name\"", "all"}));
  // After the closing quote the piece runs on to the next delimiter.
  EXPECT_EQ(SplitTexts("\"a.b\"c.d", ".", false, "\"", "\""), (Pieces{"\"a.b\"c", "d"}));
  // An unclosed quote takes the rest of the text.
  EXPECT_EQ(SplitTexts("a.\"b.c", ".", false, "\"", "\""), (Pieces{"a", "\"b.c"}));
  // A quote inside a piece does not start quoting.
  EXPECT_EQ(SplitTexts("a\"b.c\"", ".", false, "\"", "\""), (Pieces{"a\"b", "c\""}));
  EXPECT_EQ(SplitTexts("x.[a.b].y", ".", false, "[", "]"), (Pieces{"x", "[a.b]", "y"}));
  // Without quote texts the quotes are ordinary characters.
  EXPECT_EQ(SplitTexts("\"a.b\"", ".", false), (Pieces{"\"a", "b\""}));
}

TEST(StringBase, TokenRangesSkipDelimiterRuns) {
  StringBase text("  alpha,, beta  ");
  std::size_t position = 0, start = 0, length = 0;
  ASSERT_TRUE(text.GetNextTokenRange(position, " ,", start, length));
  EXPECT_EQ(text.Mid(start, length), "alpha");
  ASSERT_TRUE(text.GetNextTokenRange(position, " ,", start, length));
  EXPECT_EQ(text.Mid(start, length), "beta");
  EXPECT_FALSE(text.GetNextTokenRange(position, " ,", start, length));
  EXPECT_EQ(position, text.Length());

  std::size_t beyond = 100;
  EXPECT_FALSE(text.GetNextTokenRange(beyond, " ,", start, length));
  std::size_t fromZero = 0;
  EXPECT_FALSE(StringBase(",,,").GetNextTokenRange(fromZero, ",", start, length));
}

TEST(StringBase, TrimTruncateMidRightAndCaseChanges) {
  EXPECT_EQ(StringBase(" \t a b \r\n").Trim(), "a b");
  EXPECT_EQ(StringBase("  a  ").TrimLeft(), "a  ");
  EXPECT_EQ(StringBase("  a  ").TrimRight(), "  a");
  EXPECT_EQ(StringBase("xxaxx").Trim("x"), "a");
  EXPECT_EQ(StringBase(" \n\t").Trim(), "");
  EXPECT_EQ(StringBase("text\n\n").TrimRight("\n"), "text");
  EXPECT_EQ(StringBase("abcdef").Truncate(3), "abc");
  EXPECT_EQ(StringBase("abc").Truncate(10), "abc");
  EXPECT_EQ(StringBase("abc").Truncate(0), "");
  StringBase text("abcdef");
  EXPECT_EQ(text.Mid(2, 2), "cd");
  EXPECT_EQ(text.Mid(4), "ef");
  EXPECT_EQ(text.Mid(4, 100), "ef");
  EXPECT_EQ(text.Mid(6), "");
  EXPECT_EQ(text.Mid(100, 2), "");
  EXPECT_EQ(text.Left(100), "abcdef");
  EXPECT_EQ(text.Right(2), "ef");
  EXPECT_EQ(text.Right(100), "abcdef");
  EXPECT_EQ(text.Right(0), "");
  EXPECT_EQ(StringBase("Std_Logic_1164\xC9").MakeLower(), "std_logic_1164\xC9");
  EXPECT_EQ(StringBase("Std_Logic_1164\xE9").MakeUpper(), "STD_LOGIC_1164\xE9");
}

TEST(StringBase, ReplaceAllCountsNonOverlappingOccurrences) {
  StringBase text("a.b.c");
  EXPECT_EQ(text.ReplaceAll(".", "::"), 2u);
  EXPECT_EQ(text, "a::b::c");
  StringBase runs("aaaa");
  EXPECT_EQ(runs.ReplaceAll("aa", "a"), 2u);
  EXPECT_EQ(runs, "aa");
  StringBase growing("x");
  EXPECT_EQ(growing.ReplaceAll("x", "xx"), 1u);
  EXPECT_EQ(growing, "xx");
  EXPECT_EQ(growing.ReplaceAll("", "y"), 0u);
  EXPECT_EQ(growing.RemoveAll("x"), 2u);
  EXPECT_TRUE(growing.IsEmpty());
}

TEST(StringBase, RegexMatchReportsRangeFromOffsetWithAnchorsAtTheStart) {
  StringBase text("u1: cpu port map (a => b); u2: alu");
  std::size_t start = 0, length = 0;
  ASSERT_TRUE(text.GetRangeOfMatch("u[0-9]+:", start, length));
  EXPECT_EQ(text.Mid(start, length), "u1:");
  ASSERT_TRUE(text.GetRangeOfMatch("u[0-9]+:", start, length, 1));
  EXPECT_EQ(start, text.Find("u2:"));
  EXPECT_EQ(length, 3u);
  ASSERT_TRUE(text.GetRangeOfMatch("(port|generic) +map", start, length));
  EXPECT_EQ(text.Mid(start, length), "port map");

  // Anchors stay at the start of the text; an empty match is found at its end.
  StringBase abab("abab");
  EXPECT_TRUE(abab.GetRangeOfMatch("^ab", start, length, 0));
  EXPECT_FALSE(abab.GetRangeOfMatch("^ab", start, length, 2));
  ASSERT_TRUE(abab.GetRangeOfMatch("ab$", start, length, 1));
  EXPECT_EQ(start, 2u);
  ASSERT_TRUE(abab.GetRangeOfMatch("x*", start, length, 4));
  EXPECT_EQ(start, 4u);
  EXPECT_EQ(length, 0u);
}

TEST(StringBase, RegexFailsWithoutMatchOrWithBadInput) {
  StringBase text("entity cpu is");
  std::size_t start = 7, length = 9;
  EXPECT_FALSE(text.GetRangeOfMatch("architecture", start, length));
  EXPECT_FALSE(text.GetRangeOfMatch("cpu", start, length, 8));
  EXPECT_FALSE(text.GetRangeOfMatch("e", start, length, text.Length() + 1));
  EXPECT_FALSE(text.GetRangeOfMatch("(cpu", start, length));
  EXPECT_FALSE(text.GetRangeOfMatch("[z-a]", start, length));
  EXPECT_FALSE(text.GetRangeOfMatch(std::string_view("cpu\0x", 5), start, length));
  // Asked again, a cached invalid pattern still fails and a valid one still matches.
  EXPECT_FALSE(text.GetRangeOfMatch("(cpu", start, length));
  EXPECT_EQ(start, 7u);
  EXPECT_EQ(length, 9u);
  ASSERT_TRUE(text.GetRangeOfMatch("cpu", start, length));
  EXPECT_EQ(start, 7u);
  EXPECT_EQ(length, 3u);
}

TEST(StringBase, ManyDistinctPatternsStayCorrect) {
  StringBase text("n0 n1 n2 n3 n4 n5 n6 n7 n8 n9");
  for (int round = 0; round < 3; ++round) {
    for (int i = 0; i < 200; ++i) {
      std::size_t start = 0, length = 0;
      std::string pattern = "n" + std::to_string(i % 10) + "|q" + std::to_string(i);
      ASSERT_TRUE(text.GetRangeOfMatch(pattern, start, length)) << pattern;
      EXPECT_EQ(start, static_cast<std::size_t>(3 * (i % 10))) << pattern;
    }
  }
}
