#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "ConvertTestFixture.h"
#include "xdm/Xdm_FileFormat.h"

using convert_test::ConverterParse;
using testing::ElementsAre;
using testing::IsEmpty;

namespace {

// A netlist database holding one design whose view is `view` with the top block `block`.
std::string Database(std::string_view designProperties, std::string_view view, std::string_view block) {
  return R"({"format": "quillon-netlist", "version": 1, "designs": [{"name": "chip", "properties": {)" +
         std::string(designProperties) + R"(}, "views": [{"name": ")" + std::string(view) +
         R"(", "block": )" + std::string(block) + "}]}]}";
}

// A block of that type with these inner blocks (a primitive when there are none).
std::string Block(std::string_view name, std::string_view type, std::string_view inner = "",
                  std::string_view partition = "") {
  std::string text =
      R"({"name": ")" + std::string(name) + R"(", "properties": {"TYPE": ")" + std::string(type) + "\"";
  if (!partition.empty()) text += R"(, "PARTITION": ")" + std::string(partition) + "\"";
  text += "}";
  if (!inner.empty()) text += R"(, "blocks": [)" + std::string(inner) + "]";
  return text + "}";
}

const std::string kGate = Block("g", "and2");

class NetlistParse : public ConverterParse {
 protected:
  // A netlist converter that writes `database` as "<base name>.tbx" in the current directory.
  void InstallNetlistConverter(std::string_view database) {
    WriteBytes(tools_.Path("netlist.json"), database);
    InstallTool("edifconv",
                LogRun("edifconv") + "cp '" + tools_.Path("netlist.json") + "' \"${1%.*}.tbx\"\n");
  }

  // EDIF sources go through the converter and the netlist database.
  ScopedEnv edifEx_{"CORVANE_EDIFPARSER_EX", nullptr};
  ScopedEnv edifPlx_{"CORVANE_EDIFPARSER_PLX", "1"};
};

TEST_F(NetlistParse, EachCellTypeIsOneModuleWithItsInstancesAndPrimitivesYieldNothing) {
  InstallNetlistConverter(
      Database(R"("PART": "k100-2")", "SOURCE",
               Block("top", "top_cell",
                     Block("u1", "adder", kGate, "p0") + "," + Block("u2", "adder", kGate) + "," +
                         Block("u2", "adder", kGate) + "," + Block("g9", "or2") + "," +
                         Block("m1", "mux", Block("u7", "adder", kGate, "p1")),
                     "p9")));

  EXPECT_THAT(
      Parse(Source("design.edf", "(edif design)"), "PLUGIN_Edif"),
      ElementsAre("|ComponentInstantiation||mux|mux|u7|adder| line 0 netlist-instance partition p1 parent "
                  "|Module||mux",
                  "|ComponentInstantiation||top_cell|top_cell|m1|mux| line 0 netlist-instance parent "
                  "|Module||top_cell",
                  "|ComponentInstantiation||top_cell|top_cell|u1|adder| line 0 netlist-instance partition p0 "
                  "parent |Module||top_cell",
                  "|ComponentInstantiation||top_cell|top_cell|u2|adder| line 0 netlist-instance parent "
                  "|Module||top_cell",
                  "|Module||adder line 0 netlist-lower partition p0 flag",
                  "|Module||mux line 0 netlist-lower flag",
                  "|Module||top_cell line 0 netlist-top partition p9 flag"));
  EXPECT_EQ(Part(), "k100-2");
  EXPECT_EQ(ToolLog("edifconv"), sources_.path() + "|design.edf\n");
  EXPECT_THAT(Messages(), IsEmpty());
}

TEST_F(NetlistParse, MissingOrCorruptIntermediateFileIsReported) {
  InstallTool("edifconv", "exit 1\n");
  std::string path = Source("design.edf", "");
  EXPECT_THAT(Parse(path, "PLUGIN_Edif"), IsEmpty());
  EXPECT_THAT(Messages(), ElementsAre("error: Unable to run edifconv - Process Failed (" + path +
                                          ": edifconv exited with status 1)\n",
                                      "error: edifconv wrote no output design.tbx for design.edf\n"));

  messages_.Clear();
  InstallNetlistConverter(Database("", "SOURCE", R"({"properties": {"TYPE": "nameless"}})"));
  EXPECT_THAT(ParseAgain(), IsEmpty());
  InstallNetlistConverter(Database("", "LAYOUT", Block("top", "top_cell", kGate)));
  EXPECT_THAT(ParseAgain(), IsEmpty());
  EXPECT_THAT(Messages(),
              ElementsAre(testing::StartsWith("error: The tbx file: design.tbx may be corrupt: "),
                          testing::StartsWith("error: The tbx file: design.tbx may be corrupt: ")));

  // A database that exists but is none is not said to be impossible to open.
  messages_.Clear();
  InstallTool("edifconv", "echo 'not a database' > design.tbx\n");
  EXPECT_THAT(ParseAgain(), IsEmpty());
  EXPECT_THAT(Messages(), ElementsAre("error: design.tbx is no netlist database\n"));
}

TEST_F(NetlistParse, DeepestAllowedBlockTreeIsWalkedWithoutExhaustingTheStack) {
  const int depth = Xdm_FileFormat::kMaxBlockDepth;
  std::string block;
  for (int level = 1; level < depth; ++level) {
    const std::string number = std::to_string(level);
    block += R"({"name": "b)" + number + R"(", "properties": {"TYPE": "t)" + number + R"("}, "blocks": [)";
  }
  block += kGate;
  for (int level = 1; level < depth; ++level) block += "]}";
  InstallNetlistConverter(Database("", "SOURCE", block));

  std::vector<std::string> units = Parse(Source("deep.edf", ""), "PLUGIN_Edif");
  // A module and, but for the last, an instance for every level above the primitive.
  EXPECT_EQ(units.size(), static_cast<std::size_t>(2 * (depth - 1) - 1));
  EXPECT_THAT(units, testing::Contains("|Module||t1 line 0 netlist-top flag"));
  EXPECT_THAT(units,
              testing::Contains("|Module||t" + std::to_string(depth - 1) + " line 0 netlist-lower flag"));
  EXPECT_THAT(Messages(), IsEmpty());
}

TEST_F(NetlistParse, PlacedDatabaseNamesOneModuleAfterItsBlockWithThePluginsType) {
  std::string path =
      Source("placed.pdb", Database(R"("PART": "k200")", "PHYSICAL", Block("chip_top", "t", kGate)));
  EXPECT_THAT(Parse(path, "PLUGIN_PLX"), ElementsAre("|Module||chip_top line 0 placed-database flag"));
  EXPECT_EQ(Part(), "k200");
  EXPECT_THAT(Messages(), IsEmpty());
}

TEST_F(NetlistParse, UnreadableDatabaseStillYieldsAModuleNamedAfterTheFile) {
  EXPECT_THAT(Parse(Source("garbage.pdb", "not a database"), "PLUGIN_PLX"),
              ElementsAre("|Module||garbage line 0 placed-database flag"));
  EXPECT_THAT(Parse(Source("broken.tdb", Database("", "V", R"({"name": 7})")), "PLUGIN_TBX"),
              ElementsAre("|Module||broken line 0 intermediate-database flag"));
  EXPECT_THAT(Messages(),
              ElementsAre("warning: " + sources_.Path("garbage.pdb") + " is no netlist database\n",
                          testing::StartsWith("warning: The plx database " + sources_.Path("broken.tdb") +
                                              " may be corrupt: ")));
  EXPECT_EQ(Part(), "");
}

}  // namespace
