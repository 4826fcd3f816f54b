// Sources as users name them: simulator file lists with library searching, directories, patterns,
// standard input, and paths printed as they were given.
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "CliRun.h"

namespace cli_test {
namespace {

using Json = nlohmann::json;

// A run in tests/data/cli/libsearch.
CliResult RunInLibsearch(std::vector<std::string> args) {
  return RunQuillon(CliRun{args, DataPath("libsearch"), {}});
}

std::vector<std::string> OrderOf(std::vector<std::string> args) {
  args.insert(args.begin(), {"-q", "order"});
  CliResult result = RunInLibsearch(args);
  EXPECT_EQ(result.status, 0) << result.err;
  return Lines(result.out);
}

Json JsonOf(std::vector<std::string> args) {
  args.insert(args.begin(), {"-q", "--format", "json"});
  CliResult result = RunInLibsearch(args);
  EXPECT_EQ(result.status, 0) << result.err;
  return Json::parse(result.out);
}

// rtl/top.v needs alu (in lib/, needing mux in turn), regfile (in cells/cells.v) and counter (its
// own, also in lib/); lib/spare.v and the second module of cells.v are needed by nothing.
const std::vector<std::string> kNeeded = {"rtl/top.v", "rtl/counter.v", "lib/alu.v", "cells/cells.v",
                                          "lib/mux.v"};

TEST(SourceArguments, LibraryModulesAreReadWhenInstantiatedAndNotDefined) {
  EXPECT_EQ(OrderOf({"-F", "rtl/files.f"}), kNeeded);
  EXPECT_EQ(OrderOf({"rtl/top.v", "rtl/counter.v", "-y", "lib", "--library-file", "cells/cells.v"}), kNeeded);
  // Without the library places the design misses its modules, and says so.
  CliResult alone = RunInLibsearch({"check", "--strict", "rtl/top.v", "rtl/counter.v"});
  EXPECT_EQ(alone.status, 1);
  EXPECT_NE(alone.err.find("rtl/top.v:3: error: instance 'u_alu'"), std::string::npos) << alone.err;
}

TEST(SourceArguments, PathsPrintAsGivenAndJsonCarriesBoth) {
  EXPECT_EQ(OrderOf({"./rtl/../rtl/counter.v", "rtl//top.v"}),
            (std::vector<std::string>{"rtl/counter.v", "rtl/top.v"}));
  EXPECT_EQ(OrderOf({"--absolute", "rtl/counter.v"}),
            std::vector<std::string>{DataPath("libsearch/rtl/counter.v")});
  const Json order = JsonOf({"order", "-F", "rtl/files.f"})["order"];
  ASSERT_EQ(order.size(), kNeeded.size());
  for (std::size_t i = 0; i < kNeeded.size(); ++i) {
    EXPECT_EQ(order[i]["path"], kNeeded[i]);
    EXPECT_EQ(order[i]["fullPath"], DataPath("libsearch/" + kNeeded[i]));
  }
  const Json node = JsonOf({"tree", "rtl/counter.v"})["root"]["children"][0];
  EXPECT_EQ(node["file"], "rtl/counter.v");
  EXPECT_EQ(node["fileFullPath"], DataPath("libsearch/rtl/counter.v"));
}

TEST(SourceArguments, DirectoriesAndPatternsGiveTheirFilesSorted) {
  EXPECT_EQ(OrderOf({"lib"}),
            (std::vector<std::string>{"lib/alu.v", "lib/counter.v", "lib/mux.v", "lib/spare.v"}));
  EXPECT_EQ(OrderOf({"rtl/t*.v", "lib/[am]*.v"}),
            (std::vector<std::string>{"rtl/top.v", "lib/alu.v", "lib/mux.v"}));
  const Json order = JsonOf({"order", "--lib", "cells=cells/*.v", "lib/mux.v"})["order"];
  ASSERT_EQ(order.size(), 2u);
  EXPECT_EQ(order[0]["library"], "cells");
  EXPECT_EQ(order[1]["library"], "work");
}

TEST(SourceArguments, ListsComeFromStandardInputAndTheEnvironment) {
  ScopedTextFile nested("${HERE}/rtl/top.v // from a list named on standard input\n", "nested.f");
  ScopedTextFile input("$HERE/rtl/counter.v\n-f " + nested.path() + "\n", "stdin.f");
  CliResult result = RunQuillon(CliRun{
      {"-q", "order", "-f", "-"}, DataPath("libsearch"), {{"HERE", DataPath("libsearch")}}, input.path()});
  EXPECT_EQ(result.status, 0) << result.err;
  EXPECT_EQ(result.out, DataPath("libsearch/rtl/counter.v") + "\n" + DataPath("libsearch/rtl/top.v") + "\n");
}

}  // namespace
}  // namespace cli_test
