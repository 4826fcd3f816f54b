#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <thread>
#include <vector>

#include "VciTestSupport.h"

namespace {

using Hx_Vci::VerilogFileCache;
using vci_test::InstanceNamesOf;
using vci_test::Module;
using vci_test::NamesOf;
using vci_test::Project;
using Strings = std::vector<std::string>;

// Each file names its module by a macro of its own and instantiates the module of the file before
// it through that file's macro, so a file compiles right only after its whole prefix.
std::vector<std::string> WriteChain(const Project& project, int count) {
  std::vector<std::string> files;
  for (int i = 0; i < count; ++i) {
    std::string text = "`define NAME_" + std::to_string(i) + " mod_" + std::to_string(i) + "\n";
    text += "module `NAME_" + std::to_string(i) + ";\n";
    if (i > 0) text += "  `NAME_" + std::to_string(i - 1) + " u_prev ();\n";
    text += "endmodule\n";
    files.push_back(project.Write("chain" + std::to_string(i) + ".v", text));
  }
  return files;
}

std::vector<Module> CompilePrefix(const Project& project, const std::vector<std::string>& files,
                                  std::size_t count) {
  return project.Compile(std::vector<std::string>(files.begin(), files.begin() + static_cast<long>(count)));
}

class VerilogFileCacheTest : public testing::TestWithParam<bool> {
 protected:
  static VerilogFileCache::Limits WithWatch(bool watch) {
    VerilogFileCache::Limits limits;
    limits.watchFiles = watch;
    return limits;
  }
  Project project_{WithWatch(GetParam())};
};

TEST_P(VerilogFileCacheTest, CompilingEveryFileAfterItsPrefixScansEachFileOnce) {
  const int count = 40;
  std::vector<std::string> files = WriteChain(project_, count);
  for (int k = 1; k <= count; ++k) {
    std::vector<Module> modules = CompilePrefix(project_, files, static_cast<std::size_t>(k));
    ASSERT_EQ(NamesOf(modules), Strings{"mod_" + std::to_string(k - 1)});
    if (k > 1) {
      EXPECT_EQ(InstanceNamesOf(modules[0]), Strings{"mod_" + std::to_string(k - 2) + " u_prev"});
    }
    EXPECT_EQ(project_.cache()->ScannedFileCount(), static_cast<std::uint64_t>(k));
  }
  CompilePrefix(project_, files, count);
  EXPECT_EQ(project_.cache()->ScannedFileCount(), static_cast<std::uint64_t>(count));
}

// A project brings its files up to date in an order of its own (by name, say), not in the order of
// the compile line: prefixes of every length then follow one another, shorter after longer.
TEST_P(VerilogFileCacheTest, PrefixesInAnyOrderScanEachFileOnceAndSeeLaterChanges) {
  const int count = 24;
  std::vector<std::string> files = WriteChain(project_, count);
  auto expectPrefix = [&](int length, const std::string& previousModule) {
    std::vector<Module> modules = CompilePrefix(project_, files, static_cast<std::size_t>(length));
    ASSERT_EQ(NamesOf(modules), Strings{"mod_" + std::to_string(length - 1)});
    EXPECT_EQ(InstanceNamesOf(modules[0]), Strings{previousModule + " u_prev"});
  };
  for (int length : {2, 11, 12, 3, 20, 21, 4, 24, 5, 13}) {
    expectPrefix(length, "mod_" + std::to_string(length - 2));
  }
  EXPECT_EQ(project_.cache()->ScannedFileCount(), static_cast<std::uint64_t>(count));

  project_.Write("chain5.v",
                 "`define NAME_5 mod_5_changed\nmodule `NAME_5;\n  `NAME_4 u_prev ();\nendmodule\n");
  expectPrefix(4, "mod_2");
  expectPrefix(7, "mod_5_changed");
  // The changed file and the one after it, which is the first to start from a new macro state.
  EXPECT_EQ(project_.cache()->ScannedFileCount(), static_cast<std::uint64_t>(count + 2));
  expectPrefix(24, "mod_22");
  EXPECT_EQ(project_.cache()->ScannedFileCount(), static_cast<std::uint64_t>(count + 19));

  project_.cache()->Clear();
  expectPrefix(3, "mod_1");
  EXPECT_EQ(project_.cache()->ScannedFileCount(), static_cast<std::uint64_t>(count + 22));
}

TEST_P(VerilogFileCacheTest, ChangedFileIsScannedAgainAndItsMacrosReachTheFilesAfterIt) {
  const std::string defs = project_.Write("defs.v", "`define LEAF alpha\n");
  const std::string top = project_.Write("top.v", "module `LEAF; endmodule\n");
  EXPECT_EQ(NamesOf(project_.Compile({defs, top})), Strings{"alpha"});

  project_.Write("defs.v", "`define LEAF beta_longer\n");
  EXPECT_EQ(NamesOf(project_.Compile({defs, top})), Strings{"beta_longer"});
  EXPECT_EQ(project_.cache()->ScannedFileCount(), 4u);

  project_.Write("defs.v", "`define LEAF gamma_longe\n");  // the same size
  EXPECT_EQ(NamesOf(project_.Compile({defs, top})), Strings{"gamma_longe"});
  EXPECT_EQ(NamesOf(project_.Compile({defs, top})), Strings{"gamma_longe"});
  EXPECT_EQ(project_.cache()->ScannedFileCount(), 6u);
}

TEST_P(VerilogFileCacheTest, ChangedOrNewIncludeFilesMakeTheirIncluderCompileAgain) {
  project_.Write("header.vh", "`define NAME first\n");
  const std::string top = project_.Write("top.v",
                                         "`include \"header.vh\"\n"
                                         "`include \"late.vh\"\n"
                                         "module `NAME; endmodule\n"
                                         "`ifdef LATE module late_mod; endmodule `endif\n");
  vci_test::MessageCapture messages;
  EXPECT_EQ(NamesOf(project_.Compile({top})), Strings{"first"});

  project_.Write("header.vh", "`define NAME second_name\n");
  EXPECT_EQ(NamesOf(project_.Compile({top})), Strings{"second_name"});

  project_.Write("late.vh", "`define LATE\n");
  EXPECT_EQ(NamesOf(project_.Compile({top})), (Strings{"second_name", "late_mod"}));
  EXPECT_EQ(project_.cache()->ScannedFileCount(), 3u);
}

TEST_P(VerilogFileCacheTest, EachIncomingMacroStateKeepsItsOwnResult) {
  const std::string a = project_.Write("a.v", "`define NAME from_a\n");
  const std::string b = project_.Write("b.v", "`define NAME from_b\n");
  const std::string x = project_.Write("x.v", "module `NAME; endmodule\n");
  for (int round = 0; round < 2; ++round) {
    EXPECT_EQ(NamesOf(project_.Compile({a, x})), Strings{"from_a"});
    EXPECT_EQ(NamesOf(project_.Compile({b, x})), Strings{"from_b"});
    EXPECT_EQ(NamesOf(project_.Compile({x, "+define+NAME=from_argument"})), Strings{"from_argument"});
  }
  EXPECT_EQ(project_.cache()->ScannedFileCount(), 5u);
}

INSTANTIATE_TEST_SUITE_P(WatchedAndStatted, VerilogFileCacheTest, testing::Bool(),
                         [](const testing::TestParamInfo<bool>& info) {
                           return info.param ? std::string("Watched") : std::string("Statted");
                         });

TEST(VerilogFileCache, ResultsStayRightWhenTheCacheMustEvict) {
  VerilogFileCache::Limits limits;
  limits.maxBytes = 1;
  Project project(limits);
  std::vector<std::string> files = WriteChain(project, 6);
  for (std::size_t k = 1; k <= files.size(); ++k) {
    EXPECT_EQ(NamesOf(CompilePrefix(project, files, k)), Strings{"mod_" + std::to_string(k - 1)});
  }
  EXPECT_GT(project.cache()->ScannedFileCount(), files.size());
}

TEST(VerilogFileCache, CompilersOnSeveralThreadsShareOneCache) {
  Project project;
  std::vector<std::string> files = WriteChain(project, 12);
  std::vector<int> wrong(4, 0);
  std::vector<std::thread> threads;
  for (int t = 0; t < 4; ++t) {
    threads.emplace_back([&, t] {
      for (std::size_t k = 1; k <= files.size(); ++k) {
        if (NamesOf(CompilePrefix(project, files, k)) != Strings{"mod_" + std::to_string(k - 1)}) ++wrong[t];
      }
    });
  }
  for (std::thread& thread : threads) thread.join();
  EXPECT_EQ(wrong, std::vector<int>(4, 0));
  EXPECT_LE(project.cache()->ScannedFileCount(), 4 * files.size());
}

TEST(VerilogFileCache, CompilersShareTheProcessCacheUnlessGivenOne) {
  std::unique_ptr<Hx_Vci::DataCompiler> first = Hx_Vci::create_data_compiler();
  std::unique_ptr<Hx_Vci::DataCompiler> second = Hx_Vci::create_data_compiler();
  EXPECT_EQ(&first->cache(), VerilogFileCache::Shared().get());
  EXPECT_EQ(&first->cache(), &second->cache());
  Hx_Vci::DataCompiler own(nullptr);
  EXPECT_NE(&own.cache(), &first->cache());
}

}  // namespace
