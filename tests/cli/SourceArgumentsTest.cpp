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

const std::string kLibsearch = "libsearch";

CliResult RunIn(const std::string& dir, std::vector<std::string> args,
                std::vector<std::pair<std::string, std::string>> environment = {}) {
  return RunQuillon(CliRun{std::move(args), DataPath(dir), std::move(environment)});
}

std::vector<std::string> OrderIn(const std::string& dir, std::vector<std::string> args) {
  args.insert(args.begin(), {"-q", "order"});
  CliResult result = RunIn(dir, args);
  EXPECT_EQ(result.status, 0) << result.err;
  return Lines(result.out);
}

// rtl/top.v needs alu (in lib/, needing mux in turn), regfile (in cells/cells.v) and counter (its
// own, also in lib/); lib/spare.v and the second module of cells.v are needed by nothing.
const std::vector<std::string> kNeeded = {"rtl/top.v", "rtl/counter.v", "lib/alu.v", "cells/cells.v",
                                          "lib/mux.v"};

TEST(SourceArguments, LibraryModulesAreReadWhenInstantiatedAndNotDefined) {
  EXPECT_EQ(OrderIn(kLibsearch, {"-F", "rtl/files.f"}), kNeeded);
  EXPECT_EQ(
      OrderIn(kLibsearch, {"rtl/top.v", "rtl/counter.v", "-y", "lib", "--library-file", "cells/cells.v"}),
      kNeeded);
  ScopedTextFile list("rtl/top.v\n-y lib\n  -v cells/absent.v\n");
  CliResult missing = RunIn(kLibsearch, {"units", "-f", list.path()});
  EXPECT_EQ(missing.status, 2);
  EXPECT_NE(missing.err.find(list.path() + ":3: no such library file: cells/absent.v"), std::string::npos)
      << missing.err;
  // Without the library places the design misses its modules, and says so.
  CliResult alone = RunIn(kLibsearch, {"check", "--strict", "rtl/top.v", "rtl/counter.v"});
  EXPECT_EQ(alone.status, 1);
  EXPECT_NE(alone.err.find("rtl/top.v:3: error: instance 'u_alu'"), std::string::npos) << alone.err;
}

TEST(SourceArguments, PathsPrintAsGivenAndJsonCarriesBoth) {
  EXPECT_EQ(OrderIn(kLibsearch, {"./rtl/../rtl/counter.v", "rtl//top.v"}),
            (std::vector<std::string>{"rtl/counter.v", "rtl/top.v"}));
  EXPECT_EQ(OrderIn(kLibsearch, {"--absolute", "rtl/counter.v"}),
            std::vector<std::string>{DataPath("libsearch/rtl/counter.v")});

  CliResult json = RunIn(kLibsearch, {"-q", "--format", "json", "order", "-F", "rtl/files.f"});
  ASSERT_EQ(json.status, 0) << json.err;
  const Json order = Json::parse(json.out)["order"];
  ASSERT_EQ(order.size(), kNeeded.size());
  for (std::size_t i = 0; i < kNeeded.size(); ++i) {
    EXPECT_EQ(order[i]["path"], kNeeded[i]);
    EXPECT_EQ(order[i]["fullPath"], DataPath("libsearch/" + kNeeded[i]));
  }
  CliResult tree = RunIn(kLibsearch, {"-q", "--format", "json", "tree", "rtl/counter.v"});
  ASSERT_EQ(tree.status, 0) << tree.err;
  const Json node = Json::parse(tree.out)["root"]["children"][0];
  EXPECT_EQ(node["file"], "rtl/counter.v");
  EXPECT_EQ(node["fileFullPath"], DataPath("libsearch/rtl/counter.v"));
}

TEST(SourceArguments, DirectoriesAndPatternsGiveTheirFilesSorted) {
  EXPECT_EQ(OrderIn(kLibsearch, {"lib"}),
            (std::vector<std::string>{"lib/alu.v", "lib/counter.v", "lib/mux.v", "lib/spare.v"}));
  EXPECT_EQ(OrderIn(kLibsearch, {"rtl/t*.v", "lib/[am]*.v"}),
            (std::vector<std::string>{"rtl/top.v", "lib/alu.v", "lib/mux.v"}));
  CliResult none = RunIn(kLibsearch, {"units", "rtl/*.vhd"});
  EXPECT_EQ(none.status, 2);
  EXPECT_NE(none.err.find("no file matches the pattern rtl/*.vhd"), std::string::npos) << none.err;

  CliResult json =
      RunIn(kLibsearch, {"-q", "--format", "json", "order", "--lib", "cells=cells/*.v", "lib/mux.v"});
  ASSERT_EQ(json.status, 0) << json.err;
  const Json order = Json::parse(json.out)["order"];
  ASSERT_EQ(order.size(), 2u);
  EXPECT_EQ(order[0]["library"], "cells");
  EXPECT_EQ(order[1]["library"], "work");
}

TEST(SourceArguments, ListsComeFromStandardInputAndTheEnvironment) {
  ScopedTextFile nested("${HERE}/rtl/top.v // from a list named on standard input\n", "nested.f");
  ScopedTextFile input("$HERE/rtl/counter.v\n-f " + nested.path() + "\n", "stdin.f");
  CliResult result = RunQuillon(CliRun{
      {"-q", "order", "-f", "-"}, DataPath(kLibsearch), {{"HERE", DataPath(kLibsearch)}}, input.path()});
  EXPECT_EQ(result.status, 0) << result.err;
  EXPECT_EQ(Lines(result.out),
            (std::vector<std::string>{DataPath("libsearch/rtl/counter.v"), DataPath("libsearch/rtl/top.v")}));

  ScopedTextFile unset("rtl/top.v\n$NOT_SET_ANYWHERE/a.v\n");
  CliResult failed = RunIn(kLibsearch, {"units", "-f", unset.path()});
  EXPECT_EQ(failed.status, 2);
  EXPECT_NE(failed.err.find(unset.path() + ":2: the environment variable NOT_SET_ANYWHERE is not set"),
            std::string::npos)
      << failed.err;
}

}  // namespace
}  // namespace cli_test
