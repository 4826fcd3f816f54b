// What the EDIF scanner and grammar share during one parse of one netlist: the input, the
// parenthesis depth, the tree of cells, instances and designs built so far, and the name tables.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <deque>
#include <map>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace Port {
class Stream;
}

namespace Vad {

// A cell, instance or design of the netlist. Nodes refer to each other; the tree owns them.
struct EdifNode {
  bool hasBody = false;
  std::string designCellName;
  std::string instanceName;
  std::string cellName;
  std::string edifName;
  std::string partition;
  std::string part;
  // The parenthesis depth that closes the node's form; -1 for the root.
  std::int64_t openingDepth = -1;
  EdifNode* parent = nullptr;
  std::vector<EdifNode*> children;
};

// Nodes live in one container, so that neither building nor destroying a deeply nested tree
// recurses.
class EdifTree {
 public:
  EdifTree() { Clear(); }
  void Clear() {
    nodes_.clear();
    nodes_.emplace_back();
  }
  EdifNode& Root() { return nodes_.front(); }
  EdifNode& AddChild(EdifNode& parent, std::int64_t openingDepth) {
    EdifNode& node = nodes_.emplace_back();
    node.openingDepth = openingDepth;
    node.parent = &parent;
    parent.children.push_back(&node);
    return node;
  }

 private:
  std::deque<EdifNode> nodes_;
};

// The texts that grammar symbols carry. A value lives at most for the length of one rule, during
// which fewer than kSlots further texts are made, so a ring keeps every live one.
class EdifTextRing {
 public:
  static constexpr std::size_t kMaxLength = 1999;

  std::uint32_t Add(std::string_view text) {
    next_ = (next_ + 1) % kSlots;
    texts_[next_].assign(text.substr(0, kMaxLength));
    return next_;
  }
  // Texts joined from others: each part was cut already, so that cutting the whole could not
  // cut away a later part.
  std::uint32_t AddJoined(std::string text) {
    next_ = (next_ + 1) % kSlots;
    texts_[next_] = std::move(text);
    return next_;
  }
  const std::string& Text(std::uint32_t slot) const { return texts_[slot % kSlots]; }

 private:
  static constexpr std::uint32_t kSlots = 32;
  std::array<std::string, kSlots> texts_;
  std::uint32_t next_ = 0;
};

struct EdifParseContext {
  EdifParseContext(Port::Stream& source, EdifTree& nodes) : input(source), tree(nodes) {
    current = &tree.Root();
  }

  // Scanner events.
  void Open() { ++depth; }
  void Close();

  // Grammar actions; the arguments are text slots.
  void MarkBody() { current->hasBody = true; }
  void AddCell(std::uint32_t name);
  void AddInstance(std::uint32_t name, std::uint32_t viewRef);
  void AddDesign(std::uint32_t cellRef);
  void SetLibrary(std::uint32_t name);
  void SetPart(std::uint32_t name) { current->part = texts.Text(name); }
  void SetPartition(std::uint32_t name) { current->partition = texts.Text(name); }

  Port::Stream& input;
  EdifTree& tree;
  EdifNode* current = nullptr;
  std::int64_t depth = 0;
  std::string library;
  // "<EDIF name>|<library>" to the cell's display name.
  std::map<std::string, std::string> cells;
  // EDIF name to display name, for cells declared with a rename form.
  std::map<std::string, std::string> renames;
  EdifTextRing texts;

 private:
  EdifNode& NewNode();
};

// Runs the scanner and grammar over the context's input. 0 when the input was read to its end,
// 1 when the parse was abandoned (also when memory ran out), 2 when the parse stack overflowed.
int RunEdifGrammar(EdifParseContext& context);

}  // namespace Vad
