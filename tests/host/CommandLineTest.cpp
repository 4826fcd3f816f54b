#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Port/CommandLine.h"

namespace {

std::vector<std::string> Split(std::string_view commandLine) {
  std::vector<std::string> arguments{"stale"};
  std::size_t count = Port::CommandLine::Split(commandLine, &arguments);
  EXPECT_EQ(count, arguments.size());
  return arguments;
}

using Arguments = std::vector<std::string>;

}  // namespace

TEST(CommandLine, BlanksSeparateQuotesGroupAndShellCharactersStayPlain) {
  EXPECT_EQ(Split("  conv \t-i  \"my file.sch\"  -o out\n"),
            (Arguments{"conv", "-i", "my file.sch", "-o", "out"}));
  EXPECT_EQ(Split("pre\"mid dle\"post next"), (Arguments{"premid dlepost", "next"}));
  EXPECT_EQ(Split("a \"\" b"), (Arguments{"a", "", "b"}));
  EXPECT_EQ(Split(""), Arguments{});
  EXPECT_EQ(Split(" \t "), Arguments{});
  EXPECT_EQ(Split("echo \"say \\\"hi\\\"\""), (Arguments{"echo", "say \"hi\""}));
  EXPECT_EQ(Split("dir\\sub \"C:\\x\\top.v\""), (Arguments{"dir\\sub", "C:\\x\\top.v"}));
  EXPECT_EQ(Split("open \"unclosed text"), (Arguments{"open", "unclosed text"}));
  EXPECT_EQ(Split("run a;b $(x) `y` | > $HOME"), (Arguments{"run", "a;b", "$(x)", "`y`", "|", ">", "$HOME"}));
}
