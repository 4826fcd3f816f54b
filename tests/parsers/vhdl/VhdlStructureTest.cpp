// The VHDL parser's syntax errors: the first place where a file's nesting cannot be legal, as one
// host error message with file and line; legal VHDL never gives one.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <string>
#include <string_view>
#include <vector>

#include "Port/MsgCollector.h"
#include "Port/MsgDispatcher.h"
#include "VhdlParser.h"
#include "VhdlTestFixture.h"

using testing::ElementsAre;
using testing::IsEmpty;

namespace {

class VhdlSyntax : public vhdl_test::VhdlParse {
 protected:
  // The syntax errors that parsing the file gives, as "LINE: TEXT".
  std::vector<std::string> ErrorsOfFile(const std::string& path) {
    Port_MsgCollector collector;
    Port_MsgDispatcher::addMsgMan(&collector);
    collector.enable();
    ParseFile(path);
    Port_MsgDispatcher::removeMsgMan(&collector);
    std::vector<std::string> errors;
    for (const Port_MsgRecord& record : collector.records()) {
      EXPECT_EQ(record.type, Port_MsgMan::kError);
      EXPECT_EQ(record.category, Vad::VhdlParser::kMessageCategory);
      EXPECT_EQ(record.sourceFile, path);
      const std::string place = path + ":" + std::to_string(record.line) + ": syntax error: ";
      EXPECT_EQ(record.text.rfind(place, 0), 0u) << record.text;
      std::string text = record.text.substr(place.size());
      if (!text.empty() && text.back() == '\n') text.pop_back();
      errors.push_back(std::to_string(record.line) + ": " + text);
    }
    return errors;
  }
  std::vector<std::string> ErrorsOf(std::string_view source) { return ErrorsOfFile(Write(source)); }
};

TEST_F(VhdlSyntax, LegalVhdlOfEveryFixtureAndExampleGivesNoError) {
  const std::filesystem::path root(QUILLON_TEST_DATA_DIR);
  std::vector<std::filesystem::path> files;
  for (const auto& folder : {root, root / ".." / ".." / "examples"}) {
    for (const auto& entry : std::filesystem::recursive_directory_iterator(folder)) {
      const std::string extension = entry.path().extension().string();
      if (extension == ".vhd" || extension == ".vhdl") files.push_back(entry.path());
    }
  }
  ASSERT_GT(files.size(), 20u);
  for (const auto& file : files) EXPECT_THAT(ErrorsOfFile(file.string()), IsEmpty()) << file;
}

TEST_F(VhdlSyntax, CodeSwitchedOffForSynthesisNeedNotNest) {
  SetParseTarget("synthesis");
  EXPECT_THAT(ErrorsOf("architecture a of e is begin\n"
                       "  process begin\n"
                       "    -- synthesis translate_off\n"
                       "    if sim then\n"
                       "    -- synthesis translate_on\n"
                       "    wait;\n"
                       "  end process;\n"
                       "end;\n"),
              IsEmpty());
}

TEST_F(VhdlSyntax, ParenthesisLeftOpenIsReportedWhereEndMeetsItAndTheEntityStaysRecorded) {
  EXPECT_THAT(ErrorsOf("entity e is port (a : in bit;\nend;\n"),
              ElementsAre("2: '(' of line 1 is not closed by ')'"));
  EXPECT_THAT(Describe(FileObject(file_.Get())->GetUnitSet()),
              ElementsAre("|Entity||e line 1 entity flag uses []"));
  EXPECT_THAT(ErrorsOf("entity e is port (a : in bit);\nend;\narchitecture a of e is\nbegin\n x <= f(a;\n"),
              ElementsAre("5: '(' is not closed by ')' before the end of the file"));
  EXPECT_THAT(ErrorsOf("entity e is port (a : in bit));\nend;\n"), ElementsAre("1: ')' without '('"));
  EXPECT_THAT(ErrorsOf("architecture a of e is\nsignal s : bit := f(\nbegin\nend;\n"),
              ElementsAre("3: '(' of line 2 is not closed by ')'"));
}

TEST_F(VhdlSyntax, ConstructsWithoutTheirEndAreReported) {
  EXPECT_THAT(ErrorsOf("entity e is end;\narchitecture a of e is\nbegin\n"),
              ElementsAre("2: this architecture is not closed by 'end' before the end of the file"));
  EXPECT_THAT(ErrorsOf("entity e is port (a : in bit);\narchitecture a of e is begin end;\n"),
              ElementsAre("2: the entity of line 1 is not closed by 'end' before this architecture"));
  EXPECT_THAT(ErrorsOf("architecture a of e is begin\n process begin\n  if x then\n   y <= '1';\n"
                       " end process;\nend;\n"),
              ElementsAre("5: 'end process' does not close the if statement of line 3"));
  EXPECT_THAT(ErrorsOf("architecture a of e is begin\n g : for i in 0 to 1 generate\n end;\nend;\n"),
              ElementsAre("2: this generate statement is not closed by 'end' before the end of the file"));
}

TEST_F(VhdlSyntax, EndsThatCloseNothingOrLackTheirSemicolonAreReported) {
  EXPECT_THAT(ErrorsOf("entity e is end;\nend;\n"), ElementsAre("2: 'end' without a construct to close"));
  EXPECT_THAT(ErrorsOf("architecture a of e is begin\n process begin\n  if x then y <= '1'; end if\n"
                       " end process;\nend;\n"),
              ElementsAre("4: ';' expected after the 'end' of line 3"));
  EXPECT_THAT(ErrorsOf("entity e is end entity e"),
              ElementsAre("1: ';' expected after 'end' before the end of the file"));
}

TEST_F(VhdlSyntax, StringsAndExtendedIdentifiersMustCloseOnTheirLine) {
  EXPECT_THAT(ErrorsOf("architecture a of e is begin\n x <= \"ab;\nend;\n"),
              ElementsAre("2: the string is not closed on its line"));
  EXPECT_THAT(ErrorsOf("entity \\e is end;\n"),
              ElementsAre("1: the extended identifier is not closed on its line"));
  EXPECT_THAT(ErrorsOf("entity \\e e\\ is end;\narchitecture a of \\e e\\ is begin\n"
                       " x <= '\"' & '\\' & \"\\\" & ')';\nend;\n"),
              IsEmpty());
}

TEST_F(VhdlSyntax, OnlyTheFirstErrorOfAFileIsReported) {
  EXPECT_THAT(ErrorsOf("entity e is port (a : in bit;\nend;\nend;\nx <= \"open\n"),
              ElementsAre("2: '(' of line 1 is not closed by ')'"));
}

}  // namespace
