// The languages' own rules in resolution and order, end to end: VHDL names without letter case
// (extended identifiers excepted), Verilog files in the order given, the default architecture,
// and orders that cannot be valid.
#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <initializer_list>
#include <nlohmann/json.hpp>
#include <string>
#include <utility>
#include <vector>

#include "CliRun.h"
#include "ScopedTempDir.h"

namespace cli_test {
namespace {

using Json = nlohmann::json;

// A folder of HDL sources written for one test.
class Sources {
 public:
  Sources(std::initializer_list<std::pair<const char*, const char*>> files) {
    for (const auto& [name, text] : files) std::ofstream(dir_.Path(name), std::ios::binary) << text;
  }
  std::string operator()(const char* name) const { return dir_.Path(name); }

 private:
  ScopedTempDir dir_;
};

std::vector<std::string> With(std::vector<std::string> args, const std::vector<std::string>& more) {
  args.insert(args.end(), more.begin(), more.end());
  return args;
}

Json JsonOf(const CliResult& result) {
  Json answer = Json::parse(result.out, nullptr, false);
  EXPECT_FALSE(answer.is_discarded()) << result.out << result.err;
  return answer;
}

Json TreeOf(const std::vector<std::string>& sources) {
  CliResult result = RunQuillon(With({"-q", "--format", "json", "tree"}, sources));
  EXPECT_EQ(result.status, 0) << result.err;
  return JsonOf(result);
}

// Every node below the root as "name -> file" ("-" for a unit not in the project), depth first.
void Bindings(const Json& node, std::vector<std::string>& lines) {
  for (const Json& child : node["children"]) {
    std::string file = child["file"].is_string() ? child["file"].get<std::string>() : "-";
    lines.push_back(child["name"].get<std::string>() + " -> " + file.substr(file.rfind('/') + 1));
    Bindings(child, lines);
  }
}

std::vector<std::string> BindingsOf(const Json& tree) {
  std::vector<std::string> lines;
  Bindings(tree["root"], lines);
  return lines;
}

bool Has(const std::vector<std::string>& lines, const std::string& line) {
  for (const std::string& each : lines) {
    if (each == line) return true;
  }
  return false;
}

TEST(VhdlNames, UseClausesAndPrimaryUnitsIgnoreLetterCase) {
  Sources src{
      {"pkg.vhd", "package My_Pkg is\n  constant width : integer := 4;\nend package;\n"},
      {"vlib_pkg.vhd", "package ScoreBoardPkg_slv is\nend package ScoreBoardPkg_slv;\n"},
      {"other.vhd", "entity Other is\nend entity;\n"},
      {"user.vhd",
       "library VLIB;\nuse VLIB.ScoreboardPkg_slv.all;\nuse work.my_pkg.all;\n"
       "entity user is\nend entity;\narchitecture rtl of OTHER is\nbegin\nend architecture;\n"},
  };
  const std::vector<std::string> sources{src("user.vhd"), src("other.vhd"),   src("pkg.vhd"), "-l",
                                         "vlib",          src("vlib_pkg.vhd")};
  std::vector<std::string> bindings = BindingsOf(TreeOf(sources));
  // The keys keep the spelling of the declarations; nothing is left outside the project.
  EXPECT_TRUE(Has(bindings, "work:PackageDecl|My_Pkg -> pkg.vhd")) << testing::PrintToString(bindings);
  EXPECT_TRUE(Has(bindings, "vlib:PackageDecl|ScoreBoardPkg_slv -> vlib_pkg.vhd"))
      << testing::PrintToString(bindings);
  EXPECT_TRUE(Has(bindings, "work:Entity|Other -> other.vhd")) << testing::PrintToString(bindings);
  for (const std::string& line : bindings) EXPECT_EQ(line.find(" -> -"), std::string::npos) << line;

  CliResult order = RunQuillon(With({"order"}, sources));
  EXPECT_EQ(order.status, 0) << order.err;
  std::vector<std::string> files = Lines(order.out);
  ASSERT_EQ(files.size(), 4u);
  EXPECT_EQ(files.back(), src("user.vhd"));
}

TEST(VhdlNames, ConfigurationsAndEntityInstancesIgnoreLetterCase) {
  Sources src{
      {"sub.vhd", "entity Sub is\nend entity;\narchitecture Rtl of Sub is\nbegin\nend architecture;\n"},
      {"top.vhd",
       "entity top is\nend entity;\narchitecture rtl of top is\n"
       "  component MyComp is\n  end component;\n"
       "  for all : MYCOMP use entity WORK.SUB;\n"
       "begin\n  u_cfg : mycomp port map (a => open);\n"
       "  u_direct : entity Work.sub(RTL) port map (a => open);\nend architecture;\n"},
  };
  std::vector<std::string> bindings = BindingsOf(TreeOf({src("top.vhd"), src("sub.vhd")}));
  EXPECT_EQ(std::count(bindings.begin(), bindings.end(), "work:Architecture|Sub|Rtl -> sub.vhd"), 2)
      << testing::PrintToString(bindings);
}

TEST(VhdlNames, ExtendedIdentifiersKeepTheirLetterCase) {
  Sources src{
      {"pkg.vhd", "package \\Tab\\ is\nend package;\n"},
      {"core.vhd", "entity \\Core\\ is\nend entity;\nentity \\CORE\\ is\nend entity;\n"},
      {"user.vhd", "use work.\\Tab\\.all;\nentity exact is\nend entity;\n"},
      {"other.vhd", "use work.\\TAB\\.all;\nentity folded is\nend entity;\n"},
  };
  const std::vector<std::string> sources{src("pkg.vhd"), src("core.vhd"), src("user.vhd"), src("other.vhd")};
  CliResult tree = RunQuillon(With({"--format", "json", "tree"}, sources));
  EXPECT_EQ(tree.status, 0) << tree.err;
  std::vector<std::string> bindings = BindingsOf(JsonOf(tree));
  EXPECT_TRUE(Has(bindings, "work:PackageDecl|\\Tab\\ -> pkg.vhd")) << testing::PrintToString(bindings);
  EXPECT_TRUE(Has(bindings, "work:PackageDecl|\\TAB\\ -> -")) << testing::PrintToString(bindings);
  // Two entities, not one unit declared twice.
  EXPECT_TRUE(Has(bindings, "Entity|\\Core\\ -> core.vhd")) << testing::PrintToString(bindings);
  EXPECT_TRUE(Has(bindings, "Entity|\\CORE\\ -> core.vhd")) << testing::PrintToString(bindings);
  EXPECT_EQ(tree.err.find("DUPLICATE"), std::string::npos) << tree.err;

  // --top follows the same rule: a basic name in any case, an extended one only as written.
  EXPECT_EQ(RunQuillon(With({"order", "--top", "EXACT"}, sources)).status, 0);
  CliResult extended = RunQuillon(With({"order", "--top", "\\Core\\"}, sources));
  EXPECT_EQ(extended.status, 0) << extended.err;
  EXPECT_EQ(Lines(extended.out), std::vector<std::string>{src("core.vhd")});
  EXPECT_EQ(RunQuillon(With({"order", "--top", "\\core\\"}, sources)).status, 2);
}

std::size_t Count(const std::string& text, const std::string& what) {
  std::size_t count = 0;
  for (std::size_t at = text.find(what); at != std::string::npos; at = text.find(what, at + 1)) ++count;
  return count;
}

TEST(VerilogOrder, FilesKeepTheOrderGivenWhateverTheyInstantiate) {
  Sources src{
      // top.v defines what mid.v needs, and each instantiates a module of the other.
      {"top.v", "`define HAVE_TOP 1\nmodule top;\n  mid u_mid();\nendmodule\nmodule leaf;\nendmodule\n"},
      {"mid.v", "`ifdef HAVE_TOP\nmodule mid;\n  leaf u_leaf();\n  vh u_vh();\nendmodule\n`endif\n"},
      {"vh.vhd", "entity vh is\nend entity;\narchitecture rtl of vh is\nbegin\nend architecture;\n"},
  };
  CliResult order = RunQuillon({"order", src("top.v"), src("mid.v"), src("vh.vhd")});
  EXPECT_EQ(order.status, 0) << order.err;
  EXPECT_EQ(order.err, "");
  // The VHDL entity that mid.v instantiates still comes first.
  EXPECT_EQ(Lines(order.out), (std::vector<std::string>{src("vh.vhd"), src("top.v"), src("mid.v")}));

  CliResult check = RunQuillon({"check", src("top.v"), src("mid.v"), src("vh.vhd")});
  EXPECT_EQ(check.status, 0) << check.err;
  EXPECT_EQ(check.err, "");
  EXPECT_EQ(check.out, "3 files, 5 design units: 0 errors, 0 warnings\n");
}

TEST(VerilogOrder, ModuleMissingFromTheProjectIsLabelledAModule) {
  Sources src{{"top.v", "module top;\n  lost u_lost();\nendmodule\n"}};
  CliResult tree = RunQuillon({"tree", src("top.v")});
  EXPECT_EQ(tree.status, 0) << tree.err;
  EXPECT_NE(tree.out.find("  u_lost: lost [work:Module] (not in the project)\n"), std::string::npos)
      << tree.out;
}

// Entity leaf with architectures alpha (z_alpha.vhd) and zeta (a_zeta.vhd); top binds leaf once
// by default and once by naming alpha.
const std::pair<const char*, const char*> kLeafSources[] = {
    {"leaf.vhd", "entity leaf is\nend entity;\n"},
    {"z_alpha.vhd", "architecture alpha of leaf is\nbegin\nend architecture;\n"},
    {"a_zeta.vhd", "architecture zeta of leaf is\nbegin\nend architecture;\n"},
    {"top.vhd",
     "entity top is\nend entity;\narchitecture rtl of top is\nbegin\n"
     "  u_default : entity work.leaf port map (a => open);\n"
     "  u_alpha : entity work.leaf(alpha) port map (a => open);\nend architecture;\n"},
};

std::string BoundTo(const Json& tree, const std::string& label) {
  for (const Json& top : tree["root"]["children"]) {
    for (const Json& child : top["children"]) {
      if (child["instance"] == label)
        return child["name"].get<std::string>() + " -> " +
               child["file"].get<std::string>().substr(child["file"].get<std::string>().rfind('/') + 1);
    }
  }
  return "none";
}

TEST(DefaultArchitecture, TheOneAnalysedLastIsBoundAndOrderedLast) {
  Sources src{kLeafSources[0], kLeafSources[1], kLeafSources[2], kLeafSources[3]};
  struct Case {
    std::vector<std::string> given;
    std::string bound;
    std::string before;
    std::string after;
  };
  const Case cases[] = {
      {{src("leaf.vhd"), src("z_alpha.vhd"), src("a_zeta.vhd"), src("top.vhd")},
       "work:Architecture|leaf|zeta -> a_zeta.vhd",
       src("z_alpha.vhd"),
       src("a_zeta.vhd")},
      {{src("top.vhd"), src("a_zeta.vhd"), src("z_alpha.vhd"), src("leaf.vhd")},
       "work:Architecture|leaf|alpha -> z_alpha.vhd",
       src("a_zeta.vhd"),
       src("z_alpha.vhd")},
  };
  for (const Case& each : cases) {
    Json tree = TreeOf(each.given);
    EXPECT_EQ(BoundTo(tree, "u_default"), each.bound);
    // Naming an architecture binds that one, whichever is the default.
    EXPECT_EQ(BoundTo(tree, "u_alpha"), "work:Architecture|leaf|alpha -> z_alpha.vhd");

    CliResult order = RunQuillon(With({"order"}, each.given));
    EXPECT_EQ(order.status, 0) << order.err;
    std::vector<std::string> files = Lines(order.out);
    auto at = [&](const std::string& path) {
      return std::find(files.begin(), files.end(), path) - files.begin();
    };
    EXPECT_LT(at(each.before), at(each.after)) << order.out;
    EXPECT_LT(at(each.after), at(src("top.vhd"))) << order.out;
    EXPECT_EQ(order.err, "");
  }

  CliResult check = RunQuillon(With({"check"}, cases[0].given));
  EXPECT_EQ(check.status, 0) << check.err;
  EXPECT_EQ(check.err, src("a_zeta.vhd") +
                           ":1: warning: entity leaf (library work) has 2 architectures: alpha (" +
                           src("z_alpha.vhd") + ":1), zeta (" + src("a_zeta.vhd") +
                           ":1); an instance that names none is bound to zeta, the one analysed last "
                           "[ambiguous-architecture]\n");
}

TEST(DefaultArchitecture, NoCycleIsMadeWhenTheDefaultCannotComeLast) {
  // user.vhd holds an architecture of leaf and an instance bound to the default one, later.vhd:
  // later.vhd cannot come after user.vhd, and the order stays valid without warnings.
  Sources src{
      kLeafSources[0],
      {"user.vhd",
       "architecture early of leaf is\nbegin\nend architecture;\nentity user is\nend entity;\n"
       "architecture rtl of user is\nbegin\n  u_default : entity work.leaf port map (a => open);\n"
       "end architecture;\n"},
      {"later.vhd", "architecture late of leaf is\nbegin\nend architecture;\n"},
  };
  const std::vector<std::string> given{src("leaf.vhd"), src("user.vhd"), src("later.vhd")};
  EXPECT_EQ(BoundTo(TreeOf(given), "u_default"), "work:Architecture|leaf|late -> later.vhd");
  CliResult order = RunQuillon(With({"order"}, given));
  EXPECT_EQ(order.status, 0) << order.err;
  EXPECT_EQ(order.err, "");
  EXPECT_EQ(Lines(order.out), (std::vector<std::string>{src("leaf.vhd"), src("later.vhd"), src("user.vhd")}));
}

TEST(DefaultArchitecture, WithinOneFileTheLastArchitectureIsBound) {
  Sources src{
      {"both.vhd",
       "entity leaf is\nend entity;\narchitecture first of leaf is\nbegin\nend architecture;\n"
       "architecture second of leaf is\nbegin\nend architecture;\n"},
      kLeafSources[3],
  };
  Json tree = TreeOf({src("both.vhd"), src("top.vhd")});
  EXPECT_EQ(BoundTo(tree, "u_default"), "work:Architecture|leaf|second -> both.vhd");
}

TEST(InvalidOrder, CutOrderIsPrintedButFailsAndCheckListsEachCycleOnce) {
  // Each file's architecture uses the other file's package: no order of the two can be valid.
  const std::string tangled = std::string(QUILLON_TEST_DATA_DIR) + "/order/tangled/";
  const std::vector<std::string> sources{tangled + "x.vhd", tangled + "y.vhd"};
  CliResult order = RunQuillon(With({"order"}, sources));
  EXPECT_EQ(order.status, 1);
  EXPECT_EQ(Lines(order.out).size(), 2u);
  EXPECT_EQ(Count(order.err, "ERROR: "), 1u) << order.err;
  EXPECT_NE(order.err.find("ERROR: no valid compile order exists"), std::string::npos) << order.err;

  CliResult check = RunQuillon(With({"check"}, sources));
  EXPECT_EQ(check.status, 1);
  EXPECT_EQ(Count(check.err, "Found circular dependency consisting of the following files:"), 1u)
      << check.err;
  EXPECT_EQ(Count(check.err, "WARNING:           " + tangled + "x.vhd"), 1u) << check.err;

  // A cycle that the relaxed rule resolves leaves a valid order.
  Sources src{
      {"f1.vhd",
       "entity a is\nend entity;\narchitecture rtl of a is\nbegin\n"
       "  u : entity work.b port map (x => open);\nend architecture;\n"},
      {"f2.vhd", "entity b is\nend entity;\n"},
      {"f3.vhd",
       "architecture rtl of b is\nbegin\n  u : entity work.a port map (x => open);\nend architecture;\n"},
  };
  CliResult valid = RunQuillon({"order", src("f1.vhd"), src("f2.vhd"), src("f3.vhd")});
  EXPECT_EQ(valid.status, 0) << valid.err;
  EXPECT_NE(valid.err.find("A valid compile order was produced using the relaxed file dependency."),
            std::string::npos)
      << valid.err;
  EXPECT_EQ(Count(valid.err, "ERROR: "), 0u) << valid.err;
}

}  // namespace
}  // namespace cli_test
