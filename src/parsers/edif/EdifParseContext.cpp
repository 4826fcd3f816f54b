#include "EdifParseContext.h"

#include <cctype>

#include "EdifParser.h"
#include "Port/MsgManData.h"

namespace Vad {

namespace {

constexpr const char* kMessageSource = "../src/EdifParserEx";
constexpr const char* kRevision = "1.1";

// A rename form's text is "|<EDIF name>|<display name>".
bool IsRenameText(const std::string& text) { return !text.empty() && text[0] == '|'; }

void SplitRenameText(const std::string& text, std::string& edifName, std::string& displayName) {
  std::size_t bar = text.find('|', 1);
  if (bar == std::string::npos) bar = text.size();
  edifName = text.substr(1, bar - 1);
  displayName = bar < text.size() ? text.substr(bar + 1) : std::string();
}

// Cells and library references name a library by its EDIF name, not by its display name.
std::string EdifNameOf(const std::string& text) {
  if (!IsRenameText(text)) return text;
  std::string edifName;
  std::string displayName;
  SplitRenameText(text, edifName, displayName);
  return edifName;
}

std::string DisplayNameOf(const std::string& text) {
  if (!IsRenameText(text)) return text;
  std::string edifName;
  std::string displayName;
  SplitRenameText(text, edifName, displayName);
  return displayName;
}

bool StartsWithPrimitiveView(const std::string& viewRef) {
  static constexpr std::string_view kPrefix = "PRIM|";
  if (viewRef.size() < kPrefix.size()) return false;
  for (std::size_t i = 0; i < kPrefix.size(); ++i) {
    if (std::toupper(static_cast<unsigned char>(viewRef[i])) != kPrefix[i]) return false;
  }
  return true;
}

// The second field of "<view>|<cell>|<library>".
std::string CellOfViewRef(const std::string& viewRef) {
  std::size_t first = viewRef.find('|');
  if (first == std::string::npos) return std::string();
  std::size_t second = viewRef.find('|', first + 1);
  return viewRef.substr(first + 1, second == std::string::npos ? std::string::npos : second - first - 1);
}

}  // namespace

void EdifParseContext::Close() {
  --depth;
  if (current->openingDepth == depth && current->parent) current = current->parent;
}

EdifNode& EdifParseContext::NewNode() {
  EdifNode& node = tree.AddChild(*current, depth - 1);
  current = &node;
  return node;
}

void EdifParseContext::AddCell(std::uint32_t name) {
  const std::string& text = texts.Text(name);
  EdifNode& node = NewNode();
  if (IsRenameText(text)) {
    std::string edifName;
    std::string displayName;
    SplitRenameText(text, edifName, displayName);
    node.cellName = displayName;
    node.edifName = edifName;
    renames[edifName] = displayName;
    cells[edifName + "|" + library] = displayName;
  } else {
    node.cellName = text;
    cells[text + "|" + library] = text;
  }
}

void EdifParseContext::AddInstance(std::uint32_t name, std::uint32_t viewRef) {
  const std::string& view = texts.Text(viewRef);
  if (StartsWithPrimitiveView(view)) return;
  const std::string& text = texts.Text(name);
  std::string cell = CellOfViewRef(view);
  EdifNode& node = NewNode();
  if (IsRenameText(text)) {
    SplitRenameText(text, node.edifName, node.instanceName);
  } else {
    node.instanceName = text;
  }
  node.cellName = std::move(cell);
}

void EdifParseContext::AddDesign(std::uint32_t cellRef) {
  const std::string& key = texts.Text(cellRef);
  auto found = cells.find(key);
  if (found == cells.end() || found->second.empty()) {
    Port_MsgManData::createObject(EdifParser::kMessageCategory, kMessageSource, 0, kRevision)
        ->issueError(EdifParser::kMissingDesignCell, key.c_str());
    return;
  }
  std::string cell = DisplayNameOf(found->second);
  NewNode().designCellName = std::move(cell);
}

void EdifParseContext::SetLibrary(std::uint32_t name) { library = EdifNameOf(texts.Text(name)); }

}  // namespace Vad
