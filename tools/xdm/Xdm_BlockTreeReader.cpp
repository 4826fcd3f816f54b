#include "xdm/Xdm_BlockTreeReader.h"

#include <utility>

#include "xdm/Xdm_FileFormat.h"
#include "xdm/Xdm_FormatProblem.h"

namespace {

const std::initializer_list<std::string_view> kBlockMembers = {"name", "properties", "blocks"};

}  // namespace

static_assert(Xdm_FileFormat::kMaxBlockDepth == 10000, "kTooDeepMessage states the limit");

Xdm_BlockTreeReader::Xdm_BlockTreeReader(std::string file, std::string location)
    : file_(std::move(file)), location_(std::move(location)) {}

void Xdm_BlockTreeReader::Read(const nlohmann::json& value, Xdm_View* view) {
  try {
    ReadTree(value, view);
  } catch (const Xdm_FormatProblem& problem) {
    throw problem.At(file_, CurrentLocation());
  }
}

void Xdm_BlockTreeReader::ReadTree(const nlohmann::json& value, Xdm_View* view) {
  levels_.clear();
  Xdm_ObjectReader top(value, kBlockMembers);
  ReadContent(top, view->SetBlock(top.Name()));
  while (!levels_.empty()) {
    Level& level = levels_.back();
    if (level.next == level.blocks->size()) {
      levels_.pop_back();
      continue;
    }
    Xdm_Block* owner = level.owner;
    Xdm_ObjectReader inner((*level.blocks)[level.next++], kBlockMembers);
    ReadContent(inner, owner->AddBlock(inner.Name()));
  }
}

void Xdm_BlockTreeReader::ReadContent(const Xdm_ObjectReader& reader, Xdm_Block* block) {
  reader.ReadProperties(block);
  const nlohmann::json* blocks = reader.OptionalArray("blocks");
  if (blocks == nullptr || blocks->empty()) {
    return;
  }
  // The block being read sits at level levels_.size() + 1; its inner blocks one deeper.
  if (levels_.size() + 2 > static_cast<std::size_t>(Xdm_FileFormat::kMaxBlockDepth)) {
    throw Xdm_FormatProblem(kTooDeepMessage);
  }
  levels_.push_back({blocks, 0, block});
}

std::string Xdm_BlockTreeReader::CurrentLocation() const {
  std::string location = location_;
  for (const Level& level : levels_) {
    location += "/blocks/" + std::to_string(level.next - 1);
  }
  return location;
}
