#include "TextOutput.h"

#include <algorithm>
#include <string>
#include <string_view>
#include <utility>

namespace quillon {

namespace {

std::string Plural(std::size_t count, const char* one, const char* many) {
  return std::to_string(count) + " " + (count == 1 ? one : many);
}

// The set's order is by store key; people read a file from top to bottom.
std::vector<const UnitInfo*> InLineOrder(const std::vector<UnitInfo>& units) {
  std::vector<const UnitInfo*> ordered;
  for (const UnitInfo& unit : units) ordered.push_back(&unit);
  std::stable_sort(ordered.begin(), ordered.end(),
                   [](const UnitInfo* a, const UnitInfo* b) { return a->line < b->line; });
  return ordered;
}

}  // namespace

void TextOutput::Units(const std::vector<FileInfo>& files, std::ostream& out) {
  for (const FileInfo& file : files) Units(file, out);
}

void TextOutput::Units(const FileInfo& file, std::ostream& out) {
  for (const UnitInfo* unit : InLineOrder(file.units)) {
    const std::string& shown = unit->key.find('|') == std::string::npos ? unit->name : unit->key;
    out << file.path << ':' << unit->line << ": " << unit->type << ' ' << shown << " (library "
        << file.library << ")\n";
  }
}

void TextOutput::Tree(const TreeInfo& tree, bool fullPaths, std::ostream& out) {
  if (tree.nodes.empty()) return;
  std::vector<std::pair<std::size_t, std::size_t>> pending;  // node index, depth
  const std::vector<std::size_t>& tops = tree.Root().children;
  for (auto top = tops.rbegin(); top != tops.rend(); ++top) pending.emplace_back(*top, 0);
  while (!pending.empty()) {
    auto [index, depth] = pending.back();
    pending.pop_back();
    const TreeNodeInfo& node = tree.nodes[index];
    Node(node, depth, fullPaths, out);
    for (auto child = node.children.rbegin(); child != node.children.rend(); ++child)
      pending.emplace_back(*child, depth + 1);
  }
}

void TextOutput::Indent(std::size_t depth, std::ostream& out) {
  out << std::string(std::min(depth, kDeepestIndent) * 2, ' ');
  if (depth > kDeepestIndent) out << "(level " << depth << ") ";
}

void TextOutput::Node(const TreeNodeInfo& node, std::size_t depth, bool fullPaths, std::ostream& out) {
  Indent(depth, out);
  if (!node.instance.empty()) out << node.instance << ": ";
  out << (node.unit.empty() ? node.name : node.unit);
  if (!node.architecture.empty()) out << '(' << node.architecture << ')';
  if (!node.kind.empty()) out << " [" << node.kind << ']';
  if (node.sharedWith) {
    out << " (shared, see above)\n";
    return;
  }
  if (node.file) out << "  " << (fullPaths ? std::string_view(*node.file) : BaseNameOf(*node.file));
  if (node.libraryCell) out << " (library cell)";
  if (!node.libraryCell && !node.elementType) out << " (not in the project)";
  if (!node.partition.empty()) out << " (partition " << node.partition << ')';
  out << '\n';
  if (node.moreBelow == 0) return;
  Indent(depth + 1, out);
  out << "... (" << node.moreBelow << " more below)\n";
}

void TextOutput::Order(const std::vector<OrderEntry>& order, bool withLibrary, std::ostream& out) {
  for (const OrderEntry& entry : order) {
    if (withLibrary) out << entry.library << ' ';
    out << entry.path << '\n';
  }
}

void TextOutput::CheckSummary(std::size_t files, std::size_t units, int errors, int warnings,
                              std::ostream& out) {
  out << Plural(files, "file", "files") << ", " << Plural(units, "design unit", "design units") << ": "
      << Plural(static_cast<std::size_t>(errors), "error", "errors") << ", "
      << Plural(static_cast<std::size_t>(warnings), "warning", "warnings") << '\n';
}

void TextOutput::Ports(const std::vector<PortInfo>& ports, std::ostream& out) {
  for (const PortInfo& port : ports) {
    out << port.position << ' ' << port.name << ' ' << port.direction << ' ' << port.type;
    if (port.high && port.low) out << ' ' << *port.high << ".." << *port.low;
    out << '\n';
  }
}

}  // namespace quillon
