#include "TreeView.h"

#include <string_view>
#include <vector>

namespace quillon {

namespace {

constexpr std::string_view kEntityLead = "Entity|";

std::optional<std::size_t> FirstMatch(const TreeInfo& tree, const std::string& file,
                                      bool (*matches)(std::string_view key, std::string_view wanted),
                                      std::string_view wanted) {
  for (std::size_t i = 1; i < tree.nodes.size(); ++i) {
    const TreeNodeInfo& node = tree.nodes[i];
    if (node.sharedWith || !matches(TreeView::UnitKeyOf(node), wanted)) continue;
    if (file.empty() || node.file == file) return i;
  }
  return std::nullopt;
}

bool IsKey(std::string_view key, std::string_view wanted) { return key == wanted; }

bool IsArchitectureOf(std::string_view key, std::string_view entity) {
  constexpr std::string_view lead = "Architecture|";
  return key.substr(0, lead.size()) == lead && key.substr(lead.size(), entity.size()) == entity &&
         key.substr(lead.size() + entity.size(), 1) == "|";
}

bool IsShown(const TreeNodeInfo& node, const TreeView::Settings& settings) {
  return !settings.instancesOnly || node.type == "instance";
}

// For each node, how many shown nodes lie below it. Children come after their parents in the flat
// list, so one backward pass sums them.
std::vector<std::size_t> ShownBelow(const TreeInfo& tree, const TreeView::Settings& settings) {
  std::vector<std::size_t> below(tree.nodes.size(), 0);
  for (std::size_t i = tree.nodes.size(); i-- > 0;) {
    for (std::size_t child : tree.nodes[i].children)
      below[i] += below[child] + (IsShown(tree.nodes[child], settings) ? 1 : 0);
  }
  return below;
}

class Selection {
 public:
  Selection(const TreeInfo& tree, const TreeView::Settings& settings)
      : tree_(tree), settings_(settings), copies_(tree.nodes.size()) {
    if (settings.depth) shownBelow_ = ShownBelow(tree, settings);
  }

  TreeInfo Run() {
    TreeNodeInfo root = tree_.Root();
    root.children.clear();
    view_.nodes.push_back(std::move(root));
    if (settings_.top) {
      pending_.push_back({*settings_.top, 0, 0});
    } else {
      PushChildren(0, 0, 0);
    }
    while (!pending_.empty()) {
      Pending next = pending_.back();
      pending_.pop_back();
      Take(next);
    }
    return std::move(view_);
  }

 private:
  struct Pending {
    std::size_t original;
    std::size_t parent;  // in the view
    std::size_t level;
  };

  void PushChildren(std::size_t original, std::size_t parent, std::size_t level) {
    const std::vector<std::size_t>& children = tree_.nodes[original].children;
    for (auto child = children.rbegin(); child != children.rend(); ++child)
      pending_.push_back({*child, parent, level});
  }

  void Take(const Pending& next) {
    const TreeNodeInfo& node = tree_.nodes[next.original];
    if (!IsShown(node, settings_)) {
      if (!node.sharedWith) PushChildren(next.original, next.parent, next.level);
      return;
    }
    std::size_t index = view_.nodes.size();
    std::size_t source = node.sharedWith.value_or(next.original);
    TreeNodeInfo copy = node;
    copy.children.clear();
    copy.parent = next.parent;
    copy.position = view_.nodes[next.parent].children.size();
    copy.sharedWith = copies_[source];
    view_.nodes[next.parent].children.push_back(index);
    view_.nodes.push_back(std::move(copy));
    if (copies_[source]) return;
    copies_[source] = index;
    if (settings_.depth && next.level >= *settings_.depth) {
      view_.nodes[index].moreBelow = shownBelow_[source];
      return;
    }
    PushChildren(source, index, next.level + 1);
  }

  const TreeInfo& tree_;
  const TreeView::Settings& settings_;
  std::vector<std::optional<std::size_t>> copies_;  // where each original node is in the view
  std::vector<std::size_t> shownBelow_;
  std::vector<Pending> pending_;
  TreeInfo view_;
};

}  // namespace

// Below the top level the name has "LIBRARY:" before the key.
std::string_view TreeView::UnitKeyOf(const TreeNodeInfo& node) {
  std::string_view name = node.name;
  std::size_t colon = name.find(':');
  if (colon != std::string_view::npos && colon < name.find('|')) name.remove_prefix(colon + 1);
  return name;
}

std::optional<std::size_t> TreeView::FindUnit(const TreeInfo& tree, const std::string& key,
                                              const std::string& file) {
  std::string_view wanted = key;
  if (wanted.substr(0, kEntityLead.size()) == kEntityLead) {
    if (auto architecture = FirstMatch(tree, file, IsArchitectureOf, wanted.substr(kEntityLead.size())))
      return architecture;
  }
  return FirstMatch(tree, file, IsKey, wanted);
}

TreeInfo TreeView::Select(const TreeInfo& tree, const Settings& settings) {
  if (tree.nodes.empty()) return tree;
  return Selection(tree, settings).Run();
}

}  // namespace quillon
