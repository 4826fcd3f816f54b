#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cerrno>
#include <cstdint>
#include <cstring>
#include <string>
#include <vector>

#include "Port/File.h"
#include "Port/StringBase.h"
#include "SeededRandom.h"
#include "VhdlParser.h"
#include "VhdlTestFixture.h"

using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;
using vhdl_test::VhdlParse;

namespace {

const std::string kTopRtl = " parent |Architecture||rtl|top||";
const std::string kMixed = " parent |Architecture||RTL|Mixed_Case||";

std::string FileNotFound(const std::string& path, const char* reason) {
  Port::StringBase text;
  if (reason) {
    text.Format(Vad::VhdlParser::kFileNotFoundBecause, path.c_str(), reason);
  } else {
    text.Format(Vad::VhdlParser::kFileNotFound, path.c_str());
  }
  return text.str();
}

TEST_F(VhdlParse, RecordsEveryUnitOfAMultiUnitDesignWithLinesParentsAndContext) {
  const std::string kArch = " parent |Architecture||structural|soc_top||";
  EXPECT_THAT(
      ParseFile(QUILLON_TEST_DATA_DIR "/vhdl/soc_top.vhd"),
      ElementsAre(
          "|Architecture||rtl|counter|| line 32 architecture uses []",
          "|Architecture||structural|soc_top|| line 54 architecture uses []",
          "|ComponentInstantiation||soc_top|structural|u_count|counter| line 68 instance" + kArch,
          "|ComponentInstantiation||soc_top|structural|u_last|counter| line 81 instance" + kArch,
          "|EntityInstantiation||soc_top|structural|u_blink|work.slow_blinker|| line 78 instance" + kArch +
              " generate",
          "|EntityInstantiation||soc_top|structural|u_fast|work.counter||rtl line 72 instance" + kArch,
          "|EntityInstantiation||soc_top|structural|u_plain|work.counter|| line 75 instance" + kArch,
          "|Entity||counter line 25 entity flag uses [||Use|ieee|std_logic_1164|all| "
          "||Use|work|counter_pkg|all|]",
          "|Entity||soc_top line 48 entity flag uses [||Use|ieee|std_logic_1164|all|]",
          "|PackageBody||counter_pkg| line 13 package-body uses []",
          "|PackageDecl||counter_pkg| line 8 package uses [||Use|ieee|std_logic_1164|all| "
          "||Use|ieee|numeric_std|all|]",
          "||Library|ieee| line 4 library", "||Library|work| line 44 library",
          "||Use|ieee|numeric_std|all| line 6 use", "||Use|ieee|std_logic_1164|all| line 5 use",
          "||Use|work|counter_pkg|all| line 22 use"));
}

TEST_F(VhdlParse, ClausesAndInstancesAreRecordedWithTheirLinesParentsAndUses) {
  ExpectParses({
      {"LibraryClauseRecordsEveryNameButOnlyWithABlankAfterTheKeyword",
       "library ieee, lumen_lib;\n"
       "library\n"
       "  broken;\n"
       "library\twork;\n",
       {"||Library|ieee| line 1 library", "||Library|lumen_lib| line 1 library",
        "||Library|work| line 4 library"}},
      {"UseClauseWaitsForTheNextUnitUnlessItFollowsAUnitHeader",
       "use ieee.std_logic_1164.all;\n"
       "entity a is end;\n"
       "architecture rtl of a is\n"
       "  use work.helpers.all;\n"
       "begin\n"
       "  use work.late;\n"
       "end;\n"
       "entity b is end;\n",
       {"|Architecture||rtl|a|| line 3 architecture uses [||Use|work|helpers|all|]",
        "|Entity||a line 2 entity uses [||Use|ieee|std_logic_1164|all|]",
        "|Entity||b line 8 entity uses [||Use|work|late||]", "||Use|ieee|std_logic_1164|all| line 1 use",
        "||Use|work|helpers|all| line 4 use", "||Use|work|late|| line 6 use"}},
      {"SelectedNamesKeepTheirPartsAndSpellAllInLowerCase",
       "use lib.pkg.item;\n"
       "use work.ALL;\n"
       "use Vendor_Lib.Cells.All;\n"
       "package p is end;\n",
       {"|PackageDecl||p| line 4 package uses [||Use|lib|pkg|item| ||Use|work|all|| "
        "||Use|Vendor_Lib|Cells|all|]",
        "||Use|Vendor_Lib|Cells|all| line 3 use", "||Use|lib|pkg|item| line 1 use",
        "||Use|work|all|| line 2 use"}},
      // Extended identifiers keep their backslashes: they never match a basic identifier.
      {"InstancesAreRecordedByHowTheyNameWhatTheyInstantiate",
       "u0 : adder port map (a => b);\n"
       "entity top is end;\n"
       "architecture rtl of top is\n"
       "begin\n"
       "  u1 : adder port map (a => b);\n"
       "  u2 : component adder generic map (W => 4) port map (a => b);\n"
       "  u3 : entity work.adder port map (a => b);\n"
       "  u4 : entity work.adder(fast) port map (a => b);\n"
       "  \\u5\\ : \\odd_cell\\ port map (a => b);\n"
       "end;\n",
       {"|Architecture||rtl|top|| line 3 architecture uses []",
        "|ComponentInstantiation||top|rtl|\\u5\\|\\odd_cell\\| line 9 instance" + kTopRtl,
        "|ComponentInstantiation||top|rtl|u1|adder| line 5 instance" + kTopRtl,
        "|ComponentInstantiation||top|rtl|u2|adder| line 6 instance" + kTopRtl,
        "|EntityInstantiation||top|rtl|u3|work.adder|| line 7 instance" + kTopRtl,
        "|EntityInstantiation||top|rtl|u4|work.adder||fast line 8 instance" + kTopRtl,
        "|Entity||top line 2 entity uses []"}},
      {"KeywordsMatchInAnyCaseAndNamesMayStartWithDigitsOrAKeyword",
       "ENTITY \\Mixed_Case\\ IS END;\n"
       "Architecture RTL Of Mixed_Case Is\n"
       "BEGIN\n"
       "  2nd_stage : Adder PORT MAP (a => b);\n"
       "  beginning : endpoint Port Map (a => b);\n"
       "End;\n",
       {"|Architecture||RTL|Mixed_Case|| line 2 architecture uses []",
        "|ComponentInstantiation||Mixed_Case|RTL|2nd_stage|Adder| line 4 instance" + kMixed,
        "|ComponentInstantiation||Mixed_Case|RTL|beginning|endpoint| line 5 instance" + kMixed,
        "|Entity||\\Mixed_Case\\ line 1 entity uses []"}},
      {"EntityPortFlagFollowsItsPortClause",
       "entity with_ports is\n"
       "  port (a : in bit);\n"
       "end;\n"
       "entity with_generics is\n"
       "  generic (N : natural := 1);\n"
       "  port (a : in bit);\n"
       "end;\n"
       "entity no_ports is\n"
       "end;\n"
       "entity empty_ports is port ( ); end;\n",
       {"|Entity||empty_ports line 10 entity uses []", "|Entity||no_ports line 9 entity uses []",
        "|Entity||with_generics line 5 entity flag uses []",
        "|Entity||with_ports line 2 entity flag uses []"}},
      {"ConfigurationForAllInstancesBindsTheComponentForTheRestOfTheUnit",
       "entity top is end;\n"
       "architecture rtl of top is\n"
       "  for all : fifo use entity work.fast_fifo;\n"
       "  for others : ram use entity work.big_ram;\n"
       "  for u9 : rom use entity work.rom_impl;\n"
       "  for all : reg use entity work.reg_impl(rtl);\n"
       "  for all : cfg use configuration work.cfg_a;\n"
       "begin\n"
       "  u1 : fifo port map (a => b);\n"
       "  u2 : ram port map (a => b);\n"
       "  u3 : rom port map (a => b);\n"
       "  u4 : reg port map (a => b);\n"
       "  u5 : cfg port map (a => b);\n"
       "end;\n"
       "architecture other of top is\n"
       "begin\n"
       "  u6 : fifo port map (a => b);\n"
       "end;\n",
       {"|Architecture||other|top|| line 15 architecture uses []",
        "|Architecture||rtl|top|| line 2 architecture uses []",
        "|ComponentInstantiation||top|other|u6|fifo| line 17 instance parent "
        "|Architecture||other|top||",
        "|ComponentInstantiation||top|rtl|u2|ram| line 10 instance parent |Architecture||rtl|top||",
        "|ComponentInstantiation||top|rtl|u3|rom| line 11 instance parent |Architecture||rtl|top||",
        "|ComponentInstantiation||top|rtl|u4|reg| line 12 instance parent |Architecture||rtl|top||",
        "|ComponentInstantiation||top|rtl|u5|cfg| line 13 instance parent |Architecture||rtl|top||",
        "|EntityInstantiation||top|rtl|u1|work.fast_fifo|| line 9 instance parent "
        "|Architecture||rtl|top||",
        "|Entity||top line 1 entity uses []"}},
      {"InstancesInsideGenerateStatementsAreMarkedUntilTheMatchingEnd",
       "entity top is end;\n"
       "architecture rtl of top is\n"
       "begin\n"
       "  before_gen : cell port map (a => b);\n"
       "  g1 : for i in 0 to 3 generate\n"
       "    in_gen : cell port map (a => b);\n"
       "    g2 : if i > 0 generate\n"
       "      nested : entity work.cell port map (a => b);\n"
       "    end generate g2;\n"
       "    still_in : cell port map (a => b);\n"
       "  end generate;\n"
       "  after_gen : cell port map (a => b);\n"
       "end;\n",
       {"|Architecture||rtl|top|| line 2 architecture uses []",
        "|ComponentInstantiation||top|rtl|after_gen|cell| line 12 instance" + kTopRtl,
        "|ComponentInstantiation||top|rtl|before_gen|cell| line 4 instance" + kTopRtl,
        "|ComponentInstantiation||top|rtl|in_gen|cell| line 6 instance" + kTopRtl + " generate",
        "|ComponentInstantiation||top|rtl|still_in|cell| line 10 instance" + kTopRtl + " generate",
        "|EntityInstantiation||top|rtl|nested|work.cell|| line 8 instance" + kTopRtl + " generate",
        "|Entity||top line 1 entity uses []"}},
      {"UnterminatedStringEndsAtItsLine",
       "x <= \"open ; entity s1 is end;\n"
       "entity s2 is end;\n",
       {"|Entity||s1 line 1 entity uses []", "|Entity||s2 line 2 entity uses []"}},
      {"CrlfLineEndsCountEachLineOnce",
       "library ieee;\r\n"
       "entity a is\r\n"
       "end;\r\n"
       "-- comment\r\n"
       "architecture rtl of a is\r\n"
       "begin\r\n"
       "end;\r\n",
       {"|Architecture||rtl|a|| line 5 architecture uses []", "|Entity||a line 3 entity uses []",
        "||Library|ieee| line 1 library"}},
  });
}

const char kPragmaSource[] =
    "entity kept1 is end;\n"
    "-- synthesis translate_off\n"
    "entity hidden1 is end;\n"
    "x <= y; -- synthesis translate_on\n"
    "entity hidden2 is end;\n"
    "   -- pragma translate_on\n"
    "entity kept2 is end;\n"
    "a <= b; -- SYNOPSYS Translate_Off\n"
    "entity hidden3 is end;\n"
    "--rtl_synthesis on\n"
    "entity kept3 is end;\n"
    "-- note: synthesis translate_off\n"
    "entity kept4 is end;\n"
    "-- rtl_synthesis\toff\n"
    "-- a comment -- synthesis translate_on\n"
    "entity hidden4 is end;\n"
    "\t-- synthesis translate_on\n"
    "entity kept5 is end;\n";

TEST_F(VhdlParse, TranslatePragmasSwitchCodeOffWhenTheTargetIsSynthesis) {
  SetParseTarget("synthesis");
  EXPECT_THAT(Parse(kPragmaSource),
              ElementsAre("|Entity||kept1 line 1 entity uses []", "|Entity||kept2 line 7 entity uses []",
                          "|Entity||kept3 line 11 entity uses []", "|Entity||kept4 line 13 entity uses []",
                          "|Entity||kept5 line 18 entity uses []"));
}

TEST_F(VhdlParse, TranslatePragmasAreIgnoredUnderAnyOtherTarget) {
  for (const char* target : {"", "simulation", "Synthesis"}) {
    project_ = NewProject();
    SetParseTarget(target);
    EXPECT_THAT(
        Parse(kPragmaSource),
        ElementsAre("|Entity||hidden1 line 3 entity uses []", "|Entity||hidden2 line 5 entity uses []",
                    "|Entity||hidden3 line 9 entity uses []", "|Entity||hidden4 line 16 entity uses []",
                    "|Entity||kept1 line 1 entity uses []", "|Entity||kept2 line 7 entity uses []",
                    "|Entity||kept3 line 11 entity uses []", "|Entity||kept4 line 13 entity uses []",
                    "|Entity||kept5 line 18 entity uses []"))
        << "target " << target;
  }
}

TEST_F(VhdlParse, TranslateOnCountsInTheFirstCommentOfALineAndPragmaWordsMayRunOn) {
  SetParseTarget("synthesis");
  EXPECT_THAT(Parse("-- synthesis translate_off\n"
                    "synthesis translate_on -- pragma translate_on\n"  // code words, then the first comment
                    "entity kept_a is end;\n"
                    "--synthesis translate_off\n"
                    "entity hidden_a is end;\n"
                    "-- -- synthesis translate_on\n"  // in the second comment of the line
                    "entity hidden_b is end;\n"
                    "-- synthesis translate_on and more words\n"
                    "entity kept_b is end;\n"
                    "--synthesis translate_offset\n"
                    "entity hidden_c is end;\n"
                    "-- synthesis translate_on\n"
                    "entity kept_d is end;\n"),
              ElementsAre("|Entity||kept_a line 3 entity uses []", "|Entity||kept_b line 9 entity uses []",
                          "|Entity||kept_d line 13 entity uses []"));
}

TEST_F(VhdlParse, MalformedConstructsAreSkippedSilentlyAndParsingGoesOn) {
  testing::internal::CaptureStdout();
  EXPECT_THAT(Parse("entity ( is end;\n"
                    "architecture ;\n"
                    "library ;\n"
                    "u1 : ;\n"
                    "attribute keep of u1 : component is \"true\";\n"
                    "end generate; ) ) : ; = / , .\n"
                    "entity ok is end;\n"),
              ElementsAre("|Entity||ok line 7 entity uses []"));
  EXPECT_EQ(testing::internal::GetCapturedStdout(), "");
}

TEST_F(VhdlParse, LongTokensAreCutToTheValueLimitAndScannedInOnePass) {
  const std::string name(10'000'000, 'n');
  const std::string longLine(2'000'000, 'c');
  EXPECT_THAT(Parse("entity " + name + " is end;\n" +  // one 10 MB token
                    "-- " + longLine + "\n" +          // a comment line
                    "x <= \"" + longLine + "\";\n" +   // a string
                    "entity after is end;\n"),
              ElementsAre("|Entity||after line 4 entity uses []",
                          "|Entity||" + name.substr(0, 1999) + " line 1 entity uses []"));
}

TEST_F(VhdlParse, ListTooDeepForTheParseStackEndsTheParseQuietly) {
  auto libraryList = [](int count) {
    std::string clause = "library l0";
    for (int i = 1; i < count; ++i) clause += ", l" + std::to_string(i);
    return clause + ";\n";
  };
  EXPECT_EQ(Parse(libraryList(90)).size(), 90u);

  testing::internal::CaptureStdout();
  EXPECT_THAT(Parse("entity before is end;\n" + libraryList(150) + "entity after is end;\n"),
              ElementsAre("|Entity||before line 1 entity uses []"));
  EXPECT_EQ(testing::internal::GetCapturedStdout(), "");
}

TEST_F(VhdlParse, BinaryBytesAreScannedWithoutHarm) {
  std::string source = "entity before is end;\n" + SeededRandom(0x9E3779B97F4A7C15ull).Bytes(1 << 20) +
                       "\n;\n;\nentity after is end;\n";
  std::vector<std::string> units = Parse(source);
  EXPECT_THAT(units, Contains("|Entity||before line 1 entity uses []"));
  EXPECT_THAT(units, Contains(testing::StartsWith("|Entity||after line ")));
}

TEST_F(VhdlParse, HundredThousandNestedParenthesesAreSkipped) {
  std::string source = "entity before is end;\n" + std::string(100'000, '(') + std::string(100'000, ')') +
                       "\nentity after is end;\n";
  EXPECT_THAT(Parse(source),
              ElementsAre("|Entity||after line 3 entity uses []", "|Entity||before line 1 entity uses []"));
}

TEST_F(VhdlParse, EmptyFileRecordsNothingAndSaysNothing) {
  testing::internal::CaptureStdout();
  EXPECT_THAT(Parse(""), IsEmpty());
  EXPECT_EQ(testing::internal::GetCapturedStdout(), "");
}

TEST_F(VhdlParse, FileRemovedBeforeItsParseIsReportedWithTheSystemsReason) {
  std::string path = Write("entity gone is end;\n");
  auto file = AddNewFile(project_.Get(), path, "PLUGIN_Vhdl");
  ASSERT_TRUE(Port::File::remove_r(path.c_str()));

  testing::internal::CaptureStdout();
  HolderOf(file.Get())->Parse(nullptr);
  EXPECT_EQ(testing::internal::GetCapturedStdout(), FileNotFound(path, std::strerror(ENOENT)));
  EXPECT_THAT(Describe(FileObject(file.Get())->GetUnitSet()), IsEmpty());
}

TEST_F(VhdlParse, PathThatCannotBeReadWithoutAReasonGetsTheShortMessage) {
  testing::internal::CaptureStdout();
  EXPECT_THAT(ParseFile(dir_.path()), IsEmpty());
  EXPECT_EQ(testing::internal::GetCapturedStdout(), FileNotFound(dir_.path(), nullptr));
}

}  // namespace
