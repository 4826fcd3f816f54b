// The languages' own rules in resolution and order, end to end: VHDL names without letter case
// (extended identifiers excepted), Verilog files in the order given, the default architecture,
// and orders that cannot be valid.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "CliRun.h"

namespace cli_test {
namespace {

std::vector<std::string> With(std::vector<std::string> args, const std::vector<std::string>& more) {
  args.insert(args.end(), more.begin(), more.end());
  return args;
}

const std::vector<std::string> kJsonTree{"-q", "--format", "json", "tree"};

TEST(VhdlNames, UseClausesConfigurationsAndInstancesIgnoreLetterCase) {
  // The keys keep the spelling of the declarations; nothing is left outside the project.
  const std::vector<std::string> basic{"user.vhd", "other.vhd", "pkg.vhd", "-l", "vlib", "vlib_pkg.vhd"};
  ExpectOutputsMatch({
      {"names-basic-tree.json", With(kJsonTree, basic), 0, DataPath("names/basic")},
      {"names-basic-order.txt", With({"order"}, basic), 0, DataPath("names/basic")},
      // Both instances bind Sub(Rtl).
      {"names-config-tree.json", With(kJsonTree, {"top.vhd", "sub.vhd"}), 0, DataPath("names/config")},
  });
}

TEST(VhdlNames, ExtendedIdentifiersKeepTheirLetterCase) {
  const std::vector<std::string> sources{"pkg.vhd", "core.vhd", "user.vhd", "other.vhd"};
  const std::string dir = DataPath("names/extended");
  // \TAB\ is not \Tab\; \Core\ and \CORE\ are two entities, not one unit declared twice.
  CliResult tree = RunQuillon(CliRun{With({"--format", "json", "tree"}, sources), dir, {}});
  EXPECT_EQ(tree.status, 0) << tree.err;
  EXPECT_EQ(tree.err.find("DUPLICATE"), std::string::npos) << tree.err;
  ExpectOutputMatches(tree.out, "names-extended-tree.json");

  // --top follows the same rule: a basic name in any case, an extended one only as written.
  EXPECT_EQ(RunQuillon(CliRun{With({"order", "--top", "EXACT"}, sources), dir, {}}).status, 0);
  CliResult extended = RunQuillon(CliRun{With({"order", "--top", "\\Core\\"}, sources), dir, {}});
  EXPECT_EQ(extended.status, 0) << extended.err;
  EXPECT_EQ(extended.out, "core.vhd\n");
  ExpectRejected(RunQuillon(CliRun{With({"order", "--top", "\\core\\"}, sources), dir, {}}),
                 "unknown design unit '\\core\\'");
}

TEST(VerilogOrder, FilesKeepTheOrderGivenWhateverTheyInstantiate) {
  // top.v defines what mid.v needs, and each instantiates a module of the other; the VHDL entity
  // that mid.v instantiates still comes first.
  const std::string dir = DataPath("verilog_order");
  CliResult order = RunQuillon(CliRun{{"order", "top.v", "mid.v", "vh.vhd"}, dir, {}});
  EXPECT_EQ(order.status, 0) << order.err;
  EXPECT_EQ(order.err, "");
  EXPECT_EQ(order.out, "vh.vhd\ntop.v\nmid.v\n");

  CliResult check = RunQuillon(CliRun{{"check", "top.v", "mid.v", "vh.vhd"}, dir, {}});
  EXPECT_EQ(check.status, 0) << check.err;
  EXPECT_EQ(check.err, "");
  EXPECT_EQ(check.out, "3 files, 5 design units: 0 errors, 0 warnings\n");

  CliResult lost = RunQuillon(CliRun{{"tree", "lost.v"}, dir, {}});
  EXPECT_EQ(lost.out, "top [Module]  lost.v\n  u_lost: lost [work:Module] (not in the project)\n");
}

// Entity leaf with architectures alpha (z_alpha.vhd) and zeta (a_zeta.vhd); top binds leaf once by
// default and once by naming alpha: the default is the architecture analysed last, and its file
// comes before top's, whichever order the files are given in.
TEST(DefaultArchitecture, TheOneAnalysedLastIsBoundAndOrderedLast) {
  const std::string dir = DataPath("default_arch");
  const std::vector<std::string> zetaLast{"leaf.vhd", "z_alpha.vhd", "a_zeta.vhd", "top.vhd"};
  const std::vector<std::string> alphaLast{"top.vhd", "a_zeta.vhd", "z_alpha.vhd", "leaf.vhd"};
  // user.vhd holds an architecture of leaf and an instance bound to the default one, in later.vhd:
  // later.vhd cannot come after user.vhd, and the order stays valid without warnings.
  const std::vector<std::string> noCycle{"leaf.vhd", "user.vhd", "later.vhd"};
  ExpectOutputsMatch({
      {"default-zeta-tree.json", With(kJsonTree, zetaLast), 0, dir},
      {"default-zeta-order.txt", With({"order"}, zetaLast), 0, dir},
      {"default-alpha-tree.json", With(kJsonTree, alphaLast), 0, dir},
      {"default-alpha-order.txt", With({"order"}, alphaLast), 0, dir},
      {"default-late-tree.json", With(kJsonTree, noCycle), 0, dir},
      {"default-late-order.txt", With({"order"}, noCycle), 0, dir},
      // Within one file the last architecture is bound.
      {"default-second-tree.json", With(kJsonTree, {"both.vhd", "top.vhd"}), 0, dir},
  });
  for (const auto& given : {zetaLast, alphaLast, noCycle})
    EXPECT_EQ(RunQuillon(CliRun{With({"order"}, given), dir, {}}).err, "");

  CliResult check = RunQuillon(CliRun{With({"check"}, zetaLast), dir, {}});
  EXPECT_EQ(check.status, 0) << check.err;
  EXPECT_EQ(
      check.err,
      "a_zeta.vhd:1: warning: entity leaf (library work) has 2 architectures: alpha (z_alpha.vhd:1), zeta "
      "(a_zeta.vhd:1); an instance that names none is bound to zeta, the one analysed last "
      "[ambiguous-architecture]\n");
}

std::size_t Count(const std::string& text, const std::string& what) {
  std::size_t count = 0;
  for (std::size_t at = text.find(what); at != std::string::npos; at = text.find(what, at + 1)) ++count;
  return count;
}

TEST(InvalidOrder, CutOrderIsPrintedButFailsAndCheckListsEachCycleOnce) {
  // Each file's architecture uses the other file's package: no order of the two can be valid.
  const std::string tangled = std::string(QUILLON_TEST_DATA_DIR) + "/order/tangled";
  CliResult order = RunQuillon(CliRun{{"order", "x.vhd", "y.vhd"}, tangled, {}});
  EXPECT_EQ(order.status, 1);
  EXPECT_EQ(Lines(order.out).size(), 2u);
  EXPECT_EQ(Count(order.err, "ERROR: "), 1u) << order.err;
  EXPECT_NE(order.err.find("ERROR: no valid compile order exists"), std::string::npos) << order.err;

  CliResult check = RunQuillon(CliRun{{"check", "x.vhd", "y.vhd"}, tangled, {}});
  EXPECT_EQ(check.status, 1);
  EXPECT_EQ(Count(check.err, "Found circular dependency consisting of the following files:"), 1u)
      << check.err;
  EXPECT_EQ(Count(check.err, "WARNING:           " + tangled + "/x.vhd"), 1u) << check.err;

  // A cycle that the relaxed rule resolves leaves a valid order.
  CliResult valid = RunQuillon(CliRun{{"order", "f1.vhd", "f2.vhd", "f3.vhd"}, DataPath("relaxed"), {}});
  EXPECT_EQ(valid.status, 0) << valid.err;
  EXPECT_NE(valid.err.find("A valid compile order was produced using the relaxed file dependency."),
            std::string::npos)
      << valid.err;
  EXPECT_EQ(Count(valid.err, "ERROR: "), 0u) << valid.err;
}

}  // namespace
}  // namespace cli_test
