#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "CParserConfigHolder.h"
#include "HrfParser.h"
#include "HrfTestFixture.h"
#include "Port/InputLimits.h"
#include "SeededRandom.h"

using hrf_test::HierarchyRead;
using testing::ElementsAre;
using testing::IsEmpty;

namespace {

TEST_F(HierarchyRead, ProjectModuleLineRecordsArchitectureAndEntityAndSubmoduleAnInstanceUnderIt) {
  EXPECT_THAT(
      ReadProjectFile("MODULE top 12\n"
                      "SUBMODULE and2 14\n"),
      ElementsAre("|Architecture||top|top|| line 12 architecture",
                  "|ComponentInstantiation||INVALID_PARENT_ENTITY|INVALID_PARENT_ARCHITECT|and2|and2| "
                  "line 14 instance parent |Entity||top",
                  "|Entity||top line 12 entity flag"));
}

TEST_F(HierarchyRead, ProjectFileSkipsBlankInstanceAndUnknownLinesAndStopsAtEndHierarchy) {
  EXPECT_THAT(ReadProjectFile("  \n"
                              "\t\n"
                              "HIERARCHY\n"
                              "INSTANCE u0 3\n"
                              "MODULEX wide 4\n"
                              "\tMODULE top 5\n"
                              "MODULE \t\n"
                              " ENDHIERARCHY \t\n"
                              "MODULE late 9\n"),
              ElementsAre("|Architecture||top|top|| line 5 architecture", "|Entity||top line 5 entity flag"));
}

TEST_F(HierarchyRead, ProjectLineNumberComesFromTheThirdFieldOrANumericFourthAfterCommentMarksGo) {
  EXPECT_THAT(ReadProjectFile("PACKAGE p_dash -- 7\n"
                              "PACKAGE p_slash // note 9\n"
                              "PACKAGE p_word 5 note\n"
                              "PACKAGE p_none x\n"
                              "PACKAGE p_mixed 12abc\n"
                              "PACKAGE p_huge 99999999999\n"
                              "PACKAGE\tp_tab\t\t3\t\n"),
              ElementsAre("|PackageDecl||p_dash| line 7 package", "|PackageDecl||p_huge| line 0 package",
                          "|PackageDecl||p_mixed| line 0 package", "|PackageDecl||p_none| line 0 package",
                          "|PackageDecl||p_slash| line 9 package", "|PackageDecl||p_tab| line 3 package",
                          "|PackageDecl||p_word| line 5 package"));
}

TEST_F(HierarchyRead, ProjectPackageLinesAndSubpackageRecordPackagesAndAUse) {
  EXPECT_THAT(ReadProjectFile("PACKAGE pkg_a 2\n"
                              "PACKAGEBODY pkg_a 6\n"
                              "MODULE top 10\r\n"
                              "SUBPACKAGE pkg_a 11\n"),
              ElementsAre("|Architecture||top|top|| line 10 architecture", "|Entity||top line 10 entity flag",
                          "|PackageBody||pkg_a| line 6 package-body", "|PackageDecl||pkg_a| line 2 package",
                          "||Use|pkg_a||| line 11 use"));
}

TEST_F(HierarchyRead, ProjectReaderTakesVeryLongLinesWholeAndIgnoresBinaryLines) {
  const std::string name(100000, 'n');
  std::string text = "MODULE " + name + " 3\n";
  text += std::string("\0\x01\xff MODULE\n\xfe\x80--//\n", 17);
  std::vector<std::string> units = ReadProjectFile(text);
  ASSERT_EQ(units.size(), 2u);
  EXPECT_EQ(units[1], "|Entity||" + name + " line 3 entity flag");
}

TEST_F(HierarchyRead, ConverterInstanceRangeLabelsTheLastInstanceInEitherOrder) {
  int result = -1;
  testing::internal::CaptureStderr();
  const std::string kUnderTop = " parent |Module||top";
  EXPECT_THAT(ReadConverterOutput("MODULE top\n"
                                  "SUBMODULE and2 4\n"
                                  "INSTANCE u (0:3)\n"
                                  "SUBMODULE or2 5\n"
                                  "INSTANCE v (3:0)\n"
                                  "SUBMODULE xor2\n"
                                  "INSTANCE w\n",
                                  result),
              ElementsAre("|ComponentInstantiation||top|top|u_0|and2| line 4 instance" + kUnderTop,
                          "|ComponentInstantiation||top|top|u_1|and2| line 4 instance" + kUnderTop,
                          "|ComponentInstantiation||top|top|u_2|and2| line 4 instance" + kUnderTop,
                          "|ComponentInstantiation||top|top|u_3|and2| line 4 instance" + kUnderTop,
                          "|ComponentInstantiation||top|top|v_0|or2| line 5 instance" + kUnderTop,
                          "|ComponentInstantiation||top|top|v_1|or2| line 5 instance" + kUnderTop,
                          "|ComponentInstantiation||top|top|v_2|or2| line 5 instance" + kUnderTop,
                          "|ComponentInstantiation||top|top|v_3|or2| line 5 instance" + kUnderTop,
                          "|ComponentInstantiation||top|top|w|xor2| line 0 instance" + kUnderTop,
                          "|Module||top line 0 module flag"));
  EXPECT_EQ(testing::internal::GetCapturedStderr(), "");
  EXPECT_EQ(result, 0);
}

TEST_F(HierarchyRead, ConverterInstanceRangeTooWideIsRefusedWithAnErrorNamingFileAndLine) {
  int result = -1;
  std::vector<std::string> units = ReadConverterOutput(
      "MODULE top\n"
      "SUBMODULE and2 4\n"
      "INSTANCE u (4000000000:0)\n",
      result);
  EXPECT_EQ(Errors(),
            dir_.Path("design1.hrf") + ":3: Syntax error: instance range u(4000000000:0) too wide\n");
  EXPECT_THAT(units,
              ElementsAre("|ComponentInstantiation||top|top|and2|and2| line 4 instance parent |Module||top",
                          "|Module||top line 0 module flag"));
}

TEST_F(HierarchyRead, ConverterModuleAndSubmoduleFormsWithAndWithoutArchitectureAndLine) {
  int result = -1;
  testing::internal::CaptureStderr();
  EXPECT_THAT(
      ReadConverterOutput("MODULE ent arch 7\n"
                          "MODULE ent2 arch2\n"
                          "MODULEDECL decl 4\n"
                          "MODULEDECL decl2\n"
                          "PACKAGE pkg 3\n"
                          "PACKAGE pkg2\n"
                          "SUBPACKAGE pkg pkg2\n"
                          "MODULE m3\n"
                          "MODULE top 9\n"
                          "SUBMODULE \\and2\\ 4\n"
                          "SUBMODULE ent arch 5\n"
                          "SUBMODULE \\ent2\\ \\arch2\\\n"
                          "MISSING_SUBMODULE gone\n",
                          result),
      ElementsAre("|Architecture||arch2|ent2|| line 0 architecture",
                  "|Architecture||arch|ent|| line 7 architecture",
                  "|ComponentInstantiation||top|top|and2|and2| line 4 instance parent |Module||top",
                  "|ComponentInstantiation||top|top|gone|gone| line 0 instance parent |Module||top",
                  "|EntityInstantiation||INVALID_PARENT_ENTITY|INVALID_PARENT_ARCHITECT||ent2||arch2 line 0 "
                  "instance parent |Module||top",
                  "|EntityInstantiation||INVALID_PARENT_ENTITY|INVALID_PARENT_ARCHITECT||ent||arch line 5 "
                  "instance parent |Module||top",
                  "|Entity||decl line 4 entity flag", "|Entity||decl2 line 0 entity flag",
                  "|Module||m3 line 0 module flag", "|Module||top line 9 module flag",
                  "|PackageDecl||pkg2| line 0 package", "|PackageDecl||pkg| line 3 package"));
  EXPECT_EQ(testing::internal::GetCapturedStderr(), "");
  EXPECT_EQ(result, 0);
}

TEST_F(HierarchyRead, ConverterTestVectorsRecordAVectorModuleWithItsInstance) {
  int result = -1;
  EXPECT_THAT(ReadConverterOutput("MODULE top\nTEST_VECTORS top\n", result),
              ElementsAre("|ComponentInstantiation||top_TestVector|top_TestVector|top|top| line 0 instance "
                          "parent |Module||top",
                          "|Module||top line 0 module flag", "|Module||top line 0 test-vector"));
}

TEST_F(HierarchyRead, ConverterLinesThatFitNoRuleAreSyntaxErrorsAndTheNextLinesStillCount) {
  int result = -1;
  testing::internal::CaptureStderr();
  std::vector<std::string> units = ReadConverterOutput(
      "HIERARCHY\n"
      "MODULE top 1\n"
      "module low 2\n"
      "PACKAGEBODY pkg 3\n"
      "MODULE after 4\n"
      "ENDHIERARCHY\n",
      result);
  testing::internal::GetCapturedStderr();
  EXPECT_THAT(units, ElementsAre("|Module||after line 4 module flag", "|Module||top line 1 module flag"));
  const std::string path = dir_.Path("design1.hrf");
  EXPECT_THAT(Errors(), testing::StartsWith(path + ":1: Syntax error: parse error\n"));
  EXPECT_THAT(Errors(), testing::HasSubstr(path + ":3: Syntax error: parse error\n"));
  EXPECT_EQ(result, 0);
}

TEST_F(HierarchyRead, ConverterLineEndsMayBeCarriageReturnNewlineOrNewlineCarriageReturn) {
  int result = -1;
  testing::internal::CaptureStderr();
  EXPECT_THAT(ReadConverterOutput("MODULE a 1\r\nMODULE b 2\n\rMODULE c 3\n", result),
              ElementsAre("|Module||a line 1 module flag", "|Module||b line 2 module flag",
                          "|Module||c line 3 module flag"));
  EXPECT_EQ(testing::internal::GetCapturedStderr(), "");
}

TEST_F(HierarchyRead, ConverterFileThatCannotBeOpenedSaysSoOnStandardOutput) {
  int result = -1;
  testing::internal::CaptureStdout();
  std::vector<std::string> units = ReadConverterPath(dir_.Path("absent.hrf"), result);
  EXPECT_EQ(testing::internal::GetCapturedStdout(), "ERROR: Quillon.dll: HrfParser: File not found\n");
  EXPECT_EQ(result, 0);
  EXPECT_THAT(units, IsEmpty());
}

TEST_F(HierarchyRead, ConverterRecordsIntoTheSlotsTheCallerChose) {
  std::string path = Write("MODULE top 1\nPACKAGE pkg 2\n");
  file_ = AddNewFile(project_.Get(), path, "PLUGIN_Hrf");
  Vad::CParserConfigHolder* holder = HolderOf(file_.Get());
  Vad::CParserConfigHolder::TypeIds ids = Vad::CParserConfigHolder::DefaultTypeIds();
  ids[Vad::CParserConfigHolder::kModuleSlot] =
      Port::XUID(std::string_view("{00000000-0000-0000-0000-00000000002A}"));
  ids[Vad::CParserConfigHolder::kPackageDeclSlot] = Vad::CParserConfigHolder::NoneTypeId();
  holder->SetTypeIds(ids);
  holder->BeginParse(nullptr);
  EXPECT_EQ(Vad::qhParser(Port::StringBase(path), *holder).Parse(), 0);
  holder->EndParse();
  EXPECT_THAT(Describe(holder->GetUnitSet()),
              ElementsAre("|Module||top line 1 type {00000000-0000-0000-0000-00000000002A} flag"));
}

TEST_F(HierarchyRead, ConverterCutsOverlongNamesAndSurvivesJunk) {
  int result = -1;
  const std::string name(5000, 'n');
  std::vector<std::string> units = ReadConverterOutput("MODULE " + name + " 2\n", result);
  EXPECT_THAT(units, ElementsAre("|Module||" + name.substr(0, 1999) + " line 2 module flag"));
  EXPECT_EQ(result, 0);

  SeededRandom random(7);
  std::string junk = random.Bytes(200000) + std::string(50000, '(') + std::string(50000, '\\') +
                     std::string(100000, 'x') + "\nMODULE last 5\n";
  testing::internal::CaptureStderr();
  units = ReadConverterOutput(junk, result);
  testing::internal::GetCapturedStderr();
  EXPECT_THAT(Errors(), testing::StartsWith(dir_.Path("design2.hrf") + ":1: Syntax error: parse error\n"));
  EXPECT_THAT(units, testing::Contains("|Module||last line 5 module flag"));
  EXPECT_EQ(result, 0);
}

TEST_F(HierarchyRead, ConverterRangesOfOneFileShareABudgetOfLabels) {
  int result = -1;
  std::string text = "MODULE top\nSUBMODULE and2 4\n";
  const std::uint64_t linesWithin =
      Port::InputLimits::kMaxHierarchyLabels / Port::InputLimits::kMaxRangeLabels;
  for (std::uint64_t line = 0; line < linesWithin + 3; ++line)
    text += "INSTANCE v" + std::to_string(line) + " (0:65535)\n";
  std::vector<std::string> units = ReadConverterOutput(text, result);
  EXPECT_EQ(Errors(), dir_.Path("design1.hrf") + ":" + std::to_string(linesWithin + 3) +
                          ": the instance ranges of this file make more than " +
                          std::to_string(Port::InputLimits::kMaxHierarchyLabels) +
                          " labels; further ranges are ignored\n");
  EXPECT_EQ(result, 0);
}

// Reading this process's memory file from its start fails at once, as a damaged disk would.
constexpr const char* kUnreadable = "/proc/self/mem";

TEST_F(HierarchyRead, ConverterFileThatCannotBeReadToItsEndIsAnError) {
  int result = -1;
  ReadConverterPath(kUnreadable, result);
  EXPECT_EQ(Errors(), std::string(kUnreadable) + ":1: the file could not be read to its end\n");
}

TEST_F(HierarchyRead, ProjectFileThatCannotBeOpenedOrReadIsAnError) {
  testing::internal::CaptureStderr();
  EXPECT_THAT(ReadProjectPath(dir_.Path("absent.hrf")), IsEmpty());
  EXPECT_EQ(Errors(), "cannot open " + dir_.Path("absent.hrf") + ": No such file or directory\n");
  messages_.Clear();
  ReadProjectPath(kUnreadable);
  EXPECT_EQ(Errors(), std::string(kUnreadable) + " could not be read to its end\n");
  testing::internal::GetCapturedStderr();
}

}  // namespace
