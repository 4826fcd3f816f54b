#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

#include "vci/VerilogCommandLine.h"
#include "vci/VerilogMessageLog.h"
#include "vci/VerilogMessageText.h"

namespace {

using Hx_Vci::VerilogCommandLine;
using Strings = std::vector<std::string>;
using Defines = std::vector<std::pair<std::string, std::string>>;

Strings FilesOf(const VerilogCommandLine& commandLine) {
  return Strings(commandLine.files().begin(), commandLine.files().end());
}

TEST(VerilogCommandLine, SplitsFilesDefinesAndIncludeDirectoriesAndIgnoresOtherOptions) {
  const char* argv[] = {"commandname",
                        "/p/a.v",
                        "+dora+dataparser+CR172701",
                        "/p/b.v",
                        "+qtx_client",
                        "+define+A=1+B++C=x=y+",
                        "+incdir+/inc1+/inc2",
                        "+incdir+/inc3",
                        "+define+A=2"};
  VerilogCommandLine commandLine(9, argv);
  EXPECT_EQ(FilesOf(commandLine), (Strings{"/p/a.v", "/p/b.v"}));
  EXPECT_EQ(commandLine.defines(), (Defines{{"A", "1"}, {"B", ""}, {"C", "x=y"}, {"A", "2"}}));
  EXPECT_EQ(commandLine.includeDirs(), (Strings{"/inc1", "/inc2", "/inc3"}));
  EXPECT_TRUE(commandLine.messages().empty());
}

TEST(VerilogCommandLine, CompletesRelativePathsAndRefusesBadMacroNames) {
  const char* argv[] = {"commandname", "rel/a.v", nullptr, "", "+incdir+inc", "+define+1A=2+ok+=v"};
  VerilogCommandLine commandLine(6, argv);
  const std::string cwd = VerilogCommandLine::CurrentDirectory();
  ASSERT_FALSE(cwd.empty());
  EXPECT_EQ(FilesOf(commandLine), Strings{cwd + "/rel/a.v"});
  EXPECT_EQ(commandLine.includeDirs(), Strings{cwd + "/inc"});
  EXPECT_EQ(commandLine.defines(), (Defines{{"ok", ""}}));
  ASSERT_EQ(commandLine.messages().size(), 2u);
  EXPECT_EQ(commandLine.messages()[0].text,
            Hx_Vci::VerilogMessageLog::Format(Hx_Vci::VerilogMessageText::kBadDefine, "1A=2"));
  EXPECT_EQ(commandLine.messages()[1].text,
            Hx_Vci::VerilogMessageLog::Format(Hx_Vci::VerilogMessageText::kBadDefine, "=v"));
}

}  // namespace
