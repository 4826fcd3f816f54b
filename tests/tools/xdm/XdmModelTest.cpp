#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <filesystem>
#include <fstream>
#include <memory>
#include <string>
#include <vector>

#include "ScopedTempDir.h"
#include "SeededRandom.h"
#include "xdm/Xdm_BlockTreeReader.h"
#include "xdm/Xdm_Exception.h"
#include "xdm/Xdm_FileFormat.h"
#include "xdm/Xdm_FileReader.h"
#include "xdm/Xdm_JsonFile.h"
#include "xdm/Xdm_Model.h"
#include "xdm/Xdm_ObjectReader.h"

namespace {

using testing::HasSubstr;

constexpr const char* kHeader = R"("format": "quillon-netlist", "version": 1)";

// A database whose only design has one view "SOURCE" with `block` as its top block.
std::string OneBlockDatabase(const std::string& block) {
  return std::string("{") + kHeader +
         R"(, "designs": [{"name": "chip", "views": [{"name": "SOURCE", "block": )" + block + "}]}]}";
}

// A top block with `depth` levels of blocks, each holding the next one.
std::string ChainOfBlocks(int depth) {
  std::string text;
  for (int level = 1; level < depth; ++level) text += R"({"name": "b", "blocks": [)";
  text += R"({"name": "leaf"})";
  for (int level = 1; level < depth; ++level) text += "]}";
  return text;
}

class NetlistFile : public testing::Test {
 protected:
  std::string Write(const std::string& name, const std::string& content) {
    std::string path = dir_.Path(name);
    std::ofstream(path, std::ios::binary) << content;
    return path;
  }

  // The message that opening a file holding `content` throws.
  std::string OpenFailure(const std::string& content) { return OpenFailureOf(Write("db.json", content)); }

  std::string OpenFailureOf(const std::string& path, int mode = Xdm_Model::kOpenForReading) {
    Xdm_Model model("N", "A", "V", false);
    try {
      model.Open(path.c_str(), mode);
    } catch (const Xdm_Exception::Base& e) {
      EXPECT_EQ(model.GetDesignMgr()->GetDesignItr().Next(), nullptr) << "a failed open keeps no designs";
      return e.what();
    }
    return "(nothing thrown)";
  }

  std::string Problem(const std::string& path, const std::string& location, const std::string& problem) {
    return "netlist database \"" + path + "\"" + (location.empty() ? "" : " at " + location) + ": " + problem;
  }

  ScopedTempDir dir_;
};

template <class Call>
std::string MessageThrownBy(Call call) {
  try {
    call();
  } catch (const Xdm_Exception::Base& e) {
    return e.what();
  }
  return "(nothing thrown)";
}

// "name", the values of TYPE and PARTITION where set, then the inner blocks in brackets; checks
// that the count and the iteration agree and that every inner block knows its parent.
std::string Tree(Xdm_Block* block) {
  std::string text = block->GetName();
  for (const char* property : {"TYPE", "PARTITION"}) {
    if (const Xdm_Property* value = block->GetPropertyByName(property)) text += " " + value->GetValue();
  }
  Xdm_BlockItr inner = block->GetBlockItr();
  int count = 0;
  for (Xdm_Block* child = inner.Next(); child; child = inner.Next(), ++count) {
    EXPECT_EQ(child->GetParent(), block);
    text += (count ? ", " : " [") + Tree(child);
  }
  EXPECT_EQ(inner.Next(), nullptr);
  EXPECT_EQ(block->GetNumBlocks(), count);
  return count ? text + "]" : text;
}

std::string Quoted(const char* name) { return std::string("\"") + name + "\""; }

}  // namespace

TEST_F(NetlistFile, ReadsDesignsViewsNestedBlocksAndPropertiesInFileOrder) {
  std::string path = Write("two.json", std::string("{") + kHeader + R"(, "designs": [
    {"name": "chip", "properties": {"PART": "k100", "PART": "k200", "part": "lower"},
     "views": [
       {"name": "RTL", "block": {"name": "rtl_top"}},
       {"name": "SOURCE", "block": {"name": "top", "properties": {"TYPE": "top_cell"}, "blocks": [
         {"name": "u1", "properties": {"TYPE": "adder", "PARTITION": "p0"}, "blocks": [
           {"name": "g1", "properties": {"TYPE": "and2"}}, {"name": "g2"}]},
         {"name": "u2", "properties": {"TYPE": "adder"}}]}}]},
    {"name": "spare", "views": []}]})");

  Xdm_Model model("SnxParser", "SnxParser", "1.1", false);
  model.Open(path.c_str(), Xdm_Model::kOpenForReading);
  model.CreateTxn("txn", Xdm_Model::kTxnRead);

  Xdm_DesignItr designs = model.GetDesignMgr()->GetDesignItr();
  Xdm_Design* chip = designs.Next();
  Xdm_Design* spare = designs.Next();
  ASSERT_NE(chip, nullptr);
  ASSERT_NE(spare, nullptr);
  EXPECT_EQ(designs.Next(), nullptr);
  EXPECT_EQ(chip->GetName(), "chip");
  EXPECT_EQ(spare->GetName(), "spare");
  EXPECT_EQ(spare->GetViewItr().Next(), nullptr);
  EXPECT_EQ(spare->GetPropertyByName("PART"), nullptr);

  ASSERT_NE(chip->GetPropertyByName("PART"), nullptr);
  EXPECT_EQ(chip->GetPropertyByName("PART")->GetValue(), "k200")
      << "a repeated property keeps its last value";
  EXPECT_EQ(chip->GetPropertyByName("part")->GetValue(), "lower");
  EXPECT_EQ(chip->GetPropertyByName(nullptr), nullptr);

  Xdm_ViewItr views = chip->GetViewItr();
  EXPECT_EQ(views.Next()->GetName(), "RTL");
  EXPECT_EQ(views.Next()->GetName(), "SOURCE");
  EXPECT_EQ(views.Next(), nullptr);
  ASSERT_NE(chip->GetViewByName("SOURCE"), nullptr);
  EXPECT_EQ(chip->GetViewByName("source"), nullptr);
  EXPECT_EQ(chip->GetViewByName(nullptr), nullptr);
  EXPECT_EQ(chip->GetViewByName("RTL")->GetBlock()->GetNumBlocks(), 0);

  Xdm_Block* top = chip->GetViewByName("SOURCE")->GetBlock();
  ASSERT_NE(top, nullptr);
  EXPECT_EQ(top->GetParent(), nullptr);
  EXPECT_EQ(Tree(top), "top top_cell [u1 adder p0 [g1 and2, g2], u2 adder]");
}

TEST_F(NetlistFile, CanOpenOnlyReadableRegularFilesWithTheMarkerAndVersion) {
  std::string fifo = dir_.Path("pipe.json");
  ASSERT_EQ(mkfifo(fifo.c_str(), 0600), 0);
  SeededRandom random(7);

  EXPECT_FALSE(Xdm_Model::CanOpen(nullptr));
  EXPECT_FALSE(Xdm_Model::CanOpen(dir_.Path("missing.json").c_str()));
  EXPECT_FALSE(Xdm_Model::CanOpen(dir_.path().c_str()));
  EXPECT_FALSE(Xdm_Model::CanOpen(fifo.c_str())) << "a FIFO without a writer must not block";
  EXPECT_FALSE(Xdm_Model::CanOpen(Write("junk.bin", random.Bytes(4096)).c_str()));
  EXPECT_FALSE(Xdm_Model::CanOpen(Write("empty.json", "").c_str()));
  EXPECT_FALSE(Xdm_Model::CanOpen(Write("other.json", R"({"designs": []})").c_str()));
  EXPECT_FALSE(
      Xdm_Model::CanOpen(Write("v2.json", R"({"format": "quillon-netlist", "version": 2})").c_str()));
  EXPECT_TRUE(
      Xdm_Model::CanOpen(Write("valid.json", std::string("{") + kHeader + R"(, "designs": []})").c_str()));
  EXPECT_TRUE(Xdm_Model::CanOpen(Write("marked.json", std::string("{") + kHeader + "}").c_str()))
      << "only the marker is checked; the rest is Open's business";
}

TEST_F(NetlistFile, MalformedContentIsRejectedNamingFilePlaceAndProblem) {
  struct Case {
    std::string content;
    std::string location;
    std::string problem;
  };
  const std::string missing = Xdm_ObjectReader::kMissingMemberMessage;
  const std::string unknown = Xdm_ObjectReader::kUnknownMemberMessage;
  const std::string notObject = Xdm_ObjectReader::kNotObjectMessage;
  const std::string header = std::string("{") + kHeader;
  const std::vector<Case> cases = {
      {"[1, 2]", "", Xdm_FileReader::kNotNetlistMessage},
      {R"({"format": "other", "version": 1, "designs": []})", "", Xdm_FileReader::kNotNetlistMessage},
      {R"({"format": "quillon-netlist", "version": "1", "designs": []})", "",
       Xdm_FileReader::kUnsupportedVersionMessage},
      {R"({"format": "quillon-netlist", "version": 1.5, "designs": []})", "",
       Xdm_FileReader::kUnsupportedVersionMessage},
      {header + "}", "", missing + Quoted("designs")},
      {header + R"(, "designs": {}})", "", Quoted("designs") + Xdm_ObjectReader::kNotArrayMessage},
      {header + R"(, "designs": [], "extra": 0})", "", unknown + Quoted("extra")},
      {header + R"(, "designs": [{"name": "a", "views": []}, "b"]})", "/designs/1", notObject},
      {header + R"(, "designs": [{"views": []}]})", "/designs/0", missing + Quoted("name")},
      {header + R"(, "designs": [{"name": "", "views": []}]})", "/designs/0",
       Xdm_ObjectReader::kEmptyNameMessage},
      {header + R"(, "designs": [{"name": 5, "views": []}]})", "/designs/0",
       Quoted("name") + Xdm_ObjectReader::kNotTextMessage},
      {header + R"(, "designs": [{"name": "a"}]})", "/designs/0", missing + Quoted("views")},
      {header + R"(, "designs": [{"name": "a", "properties": ["PART"], "views": []}]})", "/designs/0",
       Quoted("properties") + " " + notObject},
      {header + R"(, "designs": [{"name": "a", "properties": {"PART": 7}, "views": []}]})", "/designs/0",
       "property " + Quoted("PART") + Xdm_ObjectReader::kPropertyNotTextMessage},
      {header + R"(, "designs": [{"name": "a", "views": [{"name": "SOURCE"}]}]})", "/designs/0/views/0",
       missing + Quoted("block")},
      {OneBlockDatabase("null"), "/designs/0/views/0/block", notObject},
      {OneBlockDatabase(R"({"name": "top", "blocks": {}})"), "/designs/0/views/0/block",
       Quoted("blocks") + Xdm_ObjectReader::kNotArrayMessage},
      {OneBlockDatabase(R"({"name": "top", "blocks": [{"name": "u1"}, {"name": "u2", "blocks": [{"name": "g",
          "properties": {"TYPE": null}}]}]})"),
       "/designs/0/views/0/block/blocks/1/blocks/0",
       "property " + Quoted("TYPE") + Xdm_ObjectReader::kPropertyNotTextMessage},
      {OneBlockDatabase(R"({"name": "top", "blocks": [{"name": "u1", "block": []}]})"),
       "/designs/0/views/0/block/blocks/0", unknown + Quoted("block")},
  };
  for (const Case& each : cases) {
    std::string path = Write("case.json", each.content);
    EXPECT_EQ(OpenFailureOf(path), Problem(path, each.location, each.problem)) << each.content;
  }
}

TEST_F(NetlistFile, FilesThatCannotBeReadAsJsonAreRejected) {
  std::string path = dir_.Path("db.json");
  EXPECT_THAT(OpenFailureOf(path), HasSubstr(Problem(path, "", Xdm_JsonFile::kCannotReadMessage)));
  EXPECT_EQ(OpenFailureOf(dir_.path()), Problem(dir_.path(), "", Xdm_JsonFile::kNotRegularFileMessage));

  SeededRandom random(11);
  EXPECT_THAT(OpenFailure(random.Bytes(10000)), HasSubstr(Problem(path, "", Xdm_JsonFile::kNotJsonMessage)));
  EXPECT_THAT(OpenFailure(R"({"format": "quillon-netlist", "version": 1, "designs": [})"),
              HasSubstr(Problem(path, "", Xdm_JsonFile::kNotJsonMessage)));
  EXPECT_THAT(OpenFailure(std::string("{") + kHeader + ", \"designs\": [{\"name\": \"\xff\"}]}"),
              HasSubstr(Problem(path, "", Xdm_JsonFile::kNotJsonMessage)))
      << "texts must be UTF-8";
  EXPECT_THAT(OpenFailure(std::string("{") + kHeader + R"(, "designs": []})" + std::string(1, '\0') + "junk"),
              HasSubstr(Problem(path, "", Xdm_JsonFile::kNotJsonMessage)));

  std::string large = dir_.Path("large.json");
  std::ofstream(large) << "{";
  std::filesystem::resize_file(large, Xdm_FileFormat::kMaxFileBytes + 1);
  EXPECT_EQ(OpenFailureOf(large), Problem(large, "", Xdm_JsonFile::kTooLargeMessage));
  EXPECT_FALSE(Xdm_Model::CanOpen(large.c_str()));
}

TEST_F(NetlistFile, BlocksNestUpToTheDepthLimitAndDeeperInputFailsWithoutExhaustingTheStack) {
  std::string deepest =
      Write("deepest.json", OneBlockDatabase(ChainOfBlocks(Xdm_FileFormat::kMaxBlockDepth)));
  Xdm_Model model("N", "A", "V", false);
  model.Open(deepest.c_str(), Xdm_Model::kOpenForReading);
  Xdm_Block* block = model.GetDesignMgr()->GetDesignItr().Next()->GetViewByName("SOURCE")->GetBlock();
  int depth = 1;
  while (block->GetNumBlocks() == 1) {
    Xdm_Block* inner = block->GetBlockItr().Next();
    ASSERT_EQ(inner->GetParent(), block);
    block = inner;
    ++depth;
  }
  EXPECT_EQ(depth, Xdm_FileFormat::kMaxBlockDepth);
  EXPECT_EQ(block->GetName(), "leaf");

  EXPECT_THAT(OpenFailure(OneBlockDatabase(ChainOfBlocks(Xdm_FileFormat::kMaxBlockDepth + 1))),
              HasSubstr(Xdm_BlockTreeReader::kTooDeepMessage));
  EXPECT_EQ(OpenFailure(std::string(1000000, '[') + std::string(1000000, ']')),
            Problem(dir_.Path("db.json"), "", Xdm_JsonFile::kTooDeepMessage));
}

TEST_F(NetlistFile, OpeningAgainReplacesTheDesignsAndAFailedOpenLeavesNothingOpen) {
  std::string first = Write("first.json", std::string("{") + kHeader +
                                              R"(, "designs": [{"name": "one", "views": []},
                                                               {"name": "two", "views": []}]})");
  std::string second =
      Write("second.json", std::string("{") + kHeader + R"(, "designs": [{"name": "three", "views": []}]})");
  std::string broken =
      Write("broken.json",
            std::string("{") + kHeader + R"(, "designs": [{"name": "four", "views": []}, {"views": []}]})");
  Xdm_Model model("N", "A", "V", false);
  Xdm_DesignMgr* designs = model.GetDesignMgr();
  EXPECT_EQ(MessageThrownBy([&] { model.CreateTxn("txn", Xdm_Model::kTxnRead); }),
            Xdm_Model::kNotOpenMessage);

  model.Open(first.c_str(), Xdm_Model::kOpenForReading);
  model.Open(second.c_str(), Xdm_Model::kOpenForReading);
  Xdm_DesignItr afterSecond = designs->GetDesignItr();
  EXPECT_EQ(afterSecond.Next()->GetName(), "three");
  EXPECT_EQ(afterSecond.Next(), nullptr);
  model.CreateTxn("txn", Xdm_Model::kTxnRead);

  EXPECT_THROW(model.Open(broken.c_str(), Xdm_Model::kOpenForReading), Xdm_Exception::Base);
  EXPECT_EQ(model.GetDesignMgr(), designs);
  EXPECT_EQ(designs->GetDesignItr().Next(), nullptr)
      << "the valid first design of the broken file is gone too";
  EXPECT_EQ(MessageThrownBy([&] { model.CreateTxn("txn", Xdm_Model::kTxnRead); }),
            Xdm_Model::kNotOpenMessage);

  model.Open(first.c_str(), Xdm_Model::kOpenForReading);
  EXPECT_EQ(OpenFailureOf(first, 1), Xdm_Model::kWrongModeMessage);
  EXPECT_THROW(model.Open(first.c_str(), 1), Xdm_Exception::Base);
  EXPECT_EQ(designs->GetDesignItr().Next(), nullptr);
  EXPECT_EQ(MessageThrownBy([&] { model.Open(nullptr, Xdm_Model::kOpenForReading); }),
            Xdm_Model::kNoPathMessage);
}

TEST(NetlistObjects, AVeryDeepBlockTreeIsReleasedWithoutExhaustingTheStack) {
  constexpr int kLevels = 200000;
  auto top = std::make_unique<Xdm_Block>("top", nullptr);
  Xdm_Block* block = top.get();
  for (int level = 0; level < kLevels; ++level) block = block->AddBlock("b");
  int levelsUp = 0;
  for (; block->GetParent() != nullptr; block = block->GetParent()) ++levelsUp;
  EXPECT_EQ(levelsUp, kLevels);
  EXPECT_EQ(block, top.get());
  top.reset();
}
