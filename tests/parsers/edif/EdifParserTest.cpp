#include <string>

#include "EdifParseContext.h"
#include "EdifTestFixture.h"
#include "ScopedEnv.h"

namespace edif_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

constexpr const char* kAlways = "CORVANE_ALWAYS_EDIF_HIER";
constexpr const char* kNever = "CORVANE_NEVER_EDIF_HIER";

// A leaf cell (declared renamed), a top cell (renamed top_1 -> top) with instances of the leaf,
// of a primitive cell written in mixed case and of a PRIM view, a cell without contents, and the
// design form naming the top cell and the part. `partition` adds partition properties to the
// leaf cell, to the instance u_other (after its view reference) and to the design.
std::string Netlist(bool partition) {
  std::string leafPartition = partition ? "    (property PARTITION (string \"zone_a\"))\n" : "";
  std::string instancePartition = partition ? " (property PARTITION (string \"zone_b\"))" : "";
  std::string designPartition = partition ? "    (property PARTITION (string \"zone_d\"))\n" : "";
  return "(edif demo_net\n"
         "  (edifVersion 2 0 0)\n"
         "  (library work_lib (edifLevel 0)\n"
         "    (cell (rename leaf_1 \"leaf\") (cellType GENERIC)\n" +
         leafPartition +
         "      (view netlist (viewType NETLIST)\n"
         "        (interface (port a (direction INPUT)))\n"
         "        (contents\n"
         "          (instance g1 (viewRef PRIM (cellRef leaf_1 (libraryRef prims))))\n"
         "          (net n1 (joined (portRef a))))))\n"
         "    (cell (rename top_1 \"top\") (cellType GENERIC)\n"
         "      (view netlist (viewType NETLIST)\n"
         "        (contents\n"
         "          (instance u_leaf (viewRef netlist (cellRef leaf_1 (libraryRef work_lib))))\n"
         "          (instance u_gate (viewRef netlist (cellRef Gate_Or2 (libraryRef work_lib))))\n"
         "          (instance (rename u_other_0 \"u_other\") (viewRef netlist (cellRef leaf_1))" +
         instancePartition +
         ")\n"
         "          (instance u_prim (viewRef prim (cellRef sub_cell (libraryRef work_lib)))))))\n"
         "    (cell empty_cell (cellType GENERIC) (view netlist (viewType NETLIST) (interface))))\n"
         "  (design demo (cellRef top_1 (libraryRef work_lib))\n"
         "    (property PART (string \"DEV-100-A\"))\n" +
         designPartition + "  ))\n";
}

std::string DesignOf(const std::string& cell, const std::string& library) {
  return "(edif d (library " + library + " (cell known_cell (view v (contents (net n1)))))\n" +
         "  (design d (cellRef " + cell + " (libraryRef " + library + "))))\n";
}

std::string TypeText(const char* id) { return Port::XUID(std::string_view(id)).ToString(); }

TEST_F(EdifRead, FlatNetlistRecordsTheRenamedTopCellAndThePart) {
  MessageLog log;
  EXPECT_THAT(Read<Vad::EdifParser>(Netlist(false)), ElementsAre("|Module||top top"));
  EXPECT_EQ(part_, "DEV-100-A");
  EXPECT_THAT(Read<Vad::EdifParserEx>(Netlist(false)), ElementsAre("|Module||top top"));
  EXPECT_EQ(part_, "DEV-100-A");
  EXPECT_THAT(log.Lines("ProjectMgmt"), IsEmpty());
}

TEST_F(EdifRead, HierarchyOnRequestRecordsCellsWithBodiesAndTheirNonPrimitiveInstances) {
  ScopedEnv always(kAlways, "1");
  MessageLog log;
  // u_gate (a primitive in mixed case), g1 and u_prim (PRIM views in either case) are left out;
  // empty_cell has neither instances nor nets.
  EXPECT_THAT(Read<Vad::EdifParserEx>(Netlist(false)),
              ElementsAre("|ComponentInstantiation||top|top|u_leaf|leaf| instance parent |Module||top",
                          "|ComponentInstantiation||top|top|u_other|leaf| instance parent |Module||top",
                          "|Module||leaf module", "|Module||top top"));
  EXPECT_EQ(part_, "DEV-100-A");
  EXPECT_THAT(log.Lines("ProjectMgmt"), IsEmpty());
}

TEST_F(EdifRead, PartitionedNetlistIsReadAsHierarchyUnlessTheEnvironmentForbidsIt) {
  const std::vector<std::string> hierarchy{
      "|ComponentInstantiation||top|top|u_leaf|leaf| instance parent |Module||top",
      "|ComponentInstantiation||top|top|u_other|leaf| instance parent |Module||top partition zone_b",
      "|Module||leaf module partition zone_a", "|Module||top top partition zone_d"};
  EXPECT_EQ(Read<Vad::EdifParserEx>(Netlist(true)), hierarchy);
  EXPECT_EQ(part_, "DEV-100-A");
  {
    ScopedEnv never(kNever, "");
    // Forced flat, the keyword scan goes past the partition properties to the design form.
    EXPECT_THAT(Read<Vad::EdifParserEx>(Netlist(true)), ElementsAre("|Module||top top"));
    EXPECT_THAT(Read<Vad::EdifParserEx>(Netlist(false)), ElementsAre("|Module||top top"));
    ScopedEnv always(kAlways, "");
    EXPECT_EQ(Read<Vad::EdifParserEx>(Netlist(true)), hierarchy);
  }
  // The basic parser never reads the hierarchy and does not stop at partitions.
  EXPECT_THAT(Read<Vad::EdifParser>(Netlist(true)), ElementsAre("|Module||top top"));
}

TEST_F(EdifRead, DesignNamingAnUnknownCellOrLibraryIsAnError) {
  const std::string unknownCell = DesignOf("other_cell", "lib_x");
  const std::string unknownLibrary =
      "(edif d (library lib_x (cell known_cell (view v (contents (net n1))))))\n"
      "(design d (cellRef known_cell (libraryRef lib_y)))\n";
  const std::string known = DesignOf("known_cell", "lib_x");
  {
    MessageLog log;
    EXPECT_THAT(Read<Vad::EdifParser>(unknownCell), IsEmpty());
    EXPECT_THAT(Read<Vad::EdifParser>(unknownLibrary), IsEmpty());
    EXPECT_THAT(Read<Vad::EdifParser>(known), ElementsAre("|Module||known_cell top"));
    EXPECT_THAT(log.Lines("ProjectMgmt"), ElementsAre("error: ERROR: cell/library \"other_cell|lib_x\", "
                                                      "referenced in design...cellref clause, not found\n",
                                                      "error: ERROR: cell/library \"known_cell|lib_y\", "
                                                      "referenced in design...cellref clause, not found\n"));
  }
  ScopedEnv always(kAlways, "1");
  MessageLog log;
  EXPECT_THAT(Read<Vad::EdifParserEx>(unknownCell, "nodesign.edf"), IsEmpty());
  // Once from the keyword scan that decides on the hierarchy, once from the grammar.
  const std::string missing =
      "error: ERROR: cell/library \"other_cell|lib_x\", referenced in design...cellref clause, "
      "not found\n";
  EXPECT_THAT(log.Lines("ProjectMgmt"),
              ElementsAre(missing, missing, "error: No design in edif file: nodesign.edf"));
  EXPECT_THAT(Read<Vad::EdifParserEx>(known), ElementsAre("|Module||known_cell top"));
}

TEST_F(EdifRead, RenamedLibraryIsReferencedByItsEdifName) {
  const std::string netlist =
      "(edif d (library (rename lib_1 \"LibOne\") (edifLevel 0)\n"
      "  (cell leaf (view v (contents (net n1))))\n"
      "  (cell top (view v (contents (instance u1 (viewRef v (cellRef leaf (libraryRef lib_1))))))))\n"
      "  (design d (cellRef top (libraryRef lib_1))))\n";
  MessageLog log;
  EXPECT_THAT(Read<Vad::EdifParser>(netlist), ElementsAre("|Module||top top"));
  ScopedEnv always(kAlways, "1");
  EXPECT_THAT(Read<Vad::EdifParserEx>(netlist),
              ElementsAre("|ComponentInstantiation||top|top|u1|leaf| instance parent |Module||top",
                          "|Module||leaf module", "|Module||top top"));
  EXPECT_THAT(log.Lines("ProjectMgmt"), IsEmpty());
}

TEST_F(EdifRead, LongestCellNameKeepsItsLibraryInTheDesignReference) {
  const std::string cell(Vad::EdifTextRing::kMaxLength, 'c');
  std::string netlist = DesignOf(cell, "lib_x");
  netlist.replace(netlist.find("known_cell"), std::string_view("known_cell").size(), cell);
  ScopedEnv always(kAlways, "1");
  MessageLog log;
  EXPECT_THAT(Read<Vad::EdifParserEx>(netlist), ElementsAre("|Module||" + cell + " top"));
  for (const std::string& line : log.Lines("ProjectMgmt"))
    EXPECT_THAT(line, testing::Not(HasSubstr("not found")));
}

TEST_F(EdifRead, SiblingHierarchyFileInTheCurrentDirectoryIsReadInstead) {
  const std::string netlist = Write("board.edf", Netlist(false));
  Write("board.hrf", "HIERARCHY\nMODULE from_hrf\nSUBMODULE sub_hrf\nENDHIERARCHY\n");
  // Elsewhere the hierarchy file is not seen.
  EXPECT_THAT(ReadPath<Vad::EdifParser>(netlist), ElementsAre("|Module||top top"));
  ScopedCurrentDir here(dir_.path());
  EXPECT_THAT(
      ReadPath<Vad::EdifParser>(netlist),
      ElementsAre("|ComponentInstantiation||from_hrf|from_hrf|sub_hrf|sub_hrf| type " +
                      TypeText("{F8EC4980-CDA2-4346-9E3C-DB50D7DA83E9}") + " parent |Module||from_hrf",
                  "|Module||from_hrf type " + TypeText("{3E515CB2-8A29-45dd-860D-0C91C6E19881}")));
  EXPECT_EQ(part_, "");
}

TEST_F(EdifRead, OverlongTokenIsCutWithAWarningAndReadingGoesOn) {
  const std::string longName(1500, 'n');
  const std::string netlist = "(edif d (library lib_x (cell " + longName +
                              " (view v (contents (net n1))))\n"
                              "  (cell top (view v (contents (net n2))))))\n"
                              "(design d (cellRef top (libraryRef lib_x)))\n";
  MessageLog log;
  EXPECT_THAT(Read<Vad::EdifParser>(netlist), ElementsAre("|Module||top top"));
  EXPECT_THAT(log.Lines("ProjectMgmt"),
              ElementsAre("warning: EDIF parser truncated token to " + longName.substr(0, 1023) + ".\n"));
}

TEST_F(EdifRead, KeywordsAreFoundInLinesLongerThanTheLineBuffer) {
  const std::string padding(20000, ' ');
  const std::string netlist = "(edif d" + padding + "(library lib_x" + padding +
                              "(cell top (view v (contents (net n1)))))" + padding + "(DESIGN d" + padding +
                              "(CellRef top (LibraryRef lib_x)))" + padding +
                              "(property part (string \"P-1\"))";
  EXPECT_THAT(Read<Vad::EdifParser>(netlist), ElementsAre("|Module||top top"));
  EXPECT_EQ(part_, "P-1");
}

TEST_F(EdifRead, UnopenableFileRecordsNothingAndOnlyTheHierarchyReaderSaysSo) {
  const std::string missing = dir_.Path("absent.edf");
  MessageLog log;
  EXPECT_THAT(ReadPath<Vad::EdifParser>(missing), IsEmpty());
  EXPECT_THAT(ReadPath<Vad::EdifParserEx>(missing), IsEmpty());
  EXPECT_THAT(log.Lines("ProjectMgmt"), IsEmpty());
  ScopedEnv always(kAlways, "1");
  EXPECT_THAT(ReadPath<Vad::EdifParserEx>(missing), IsEmpty());
  EXPECT_THAT(log.Lines("ProjectMgmt"),
              ElementsAre("error: ERROR: Quillon.dll: EdifParserEx: " + missing + " file not found\n"));
}

TEST_F(EdifRead, MalformedInputEndsTheParseWithoutHarm) {
  ScopedEnv always(kAlways, "1");
  std::string junk;
  for (int i = 0; i < 70000; ++i) junk += static_cast<char>((i * 7919) % 256);
  EXPECT_THAT(Read<Vad::EdifParserEx>(junk), IsEmpty());
  EXPECT_THAT(Read<Vad::EdifParser>(junk), IsEmpty());

  // Surplus closing parentheses before the design, a form left open at the end.
  const std::string unbalanced =
      ")))))(library lib_x (cell top (view v (contents (net n1)))))))))\n"
      "(design d (cellRef top (libraryRef lib_x))) ((((cell";
  EXPECT_THAT(Read<Vad::EdifParserEx>(unbalanced), ElementsAre("|Module||top top"));
  EXPECT_THAT(Read<Vad::EdifParser>(unbalanced), ElementsAre("|Module||top top"));

  // Cells nested in cells, each with a net, as deep as the file goes.
  constexpr int kDepth = 50000;
  std::string deep = "(library lib_x ";
  for (int i = 0; i < kDepth; ++i) deep += "(cell c" + std::to_string(i) + " (net n) ";
  deep += std::string(kDepth, ')') + ")(design d (cellRef c0 (libraryRef lib_x)))";
  std::vector<std::string> units = Read<Vad::EdifParserEx>(deep);
  EXPECT_EQ(units.size(), static_cast<std::size_t>(kDepth));
  EXPECT_THAT(units, testing::Contains("|Module||c0 top"));
  EXPECT_THAT(units, testing::Contains("|Module||c49999 module"));
}

}  // namespace
}  // namespace edif_test
