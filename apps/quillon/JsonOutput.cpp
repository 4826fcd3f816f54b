#include "JsonOutput.h"

#include <algorithm>
#include <nlohmann/json.hpp>
#include <string>

namespace quillon {

namespace {

using Json = nlohmann::ordered_json;

template <class T>
Json OrNull(const std::optional<T>& value) {
  return value ? Json(*value) : Json(nullptr);
}

template <class T>
void PutWhenSet(Json& object, const char* name, const std::optional<T>& value) {
  if (value) object[name] = *value;
}

Json MessageList(const std::vector<MessageInfo>& messages) {
  Json list = Json::array();
  for (const MessageInfo& message : messages) {
    list.push_back({{"severity", message.severity},
                    {"text", message.text},
                    {"source", message.source},
                    {"sourceFullPath", message.sourceFullPath},
                    {"line", message.line}});
  }
  return list;
}

// A line of 0 (no line) is null.
Json DiagnosticList(const std::vector<Diagnostic>& diagnostics) {
  Json list = Json::array();
  for (const Diagnostic& diagnostic : diagnostics) {
    list.push_back({{"severity", diagnostic.SeverityText()},
                    {"code", diagnostic.code},
                    {"text", diagnostic.text},
                    {"file", diagnostic.file},
                    {"fileFullPath", diagnostic.fileFullPath},
                    {"line", diagnostic.line == 0 ? Json(nullptr) : Json(diagnostic.line)}});
  }
  return list;
}

Json UnitObject(const UnitInfo& unit) {
  Json object = {{"type", unit.type},
                 {"name", unit.name},
                 {"key", unit.key},
                 {"storeKey", unit.storeKey},
                 {"line", unit.line},
                 {"parent", OrNull(unit.parent)},
                 {"inGenerate", unit.inGenerate},
                 {"unitFlag", unit.unitFlag},
                 {"partition", unit.partition}};
  PutWhenSet(object, "entity", unit.entity);
  PutWhenSet(object, "architecture", unit.architecture);
  PutWhenSet(object, "component", unit.component);
  PutWhenSet(object, "library", unit.library);
  PutWhenSet(object, "package", unit.package);
  PutWhenSet(object, "item", unit.item);
  if (unit.uses) object["uses"] = *unit.uses;
  return object;
}

Json FileObject(const FileInfo& file) {
  Json units = Json::array();
  for (const UnitInfo& unit : file.units) units.push_back(UnitObject(unit));
  return {{"path", file.path},
          {"fullPath", file.fullPath},
          {"plugin", file.plugin},
          {"library", file.library},
          {"units", std::move(units)}};
}

std::string Scalar(const Json& value) { return value.dump(-1, ' ', false, Json::error_handler_t::replace); }

std::string Indent(std::size_t level) {
  return std::string(std::min(level, JsonOutput::kDeepestIndent) * 2, ' ');
}

// "/root/children/I/children/J..." of the node at `index`.
std::string PointerTo(const TreeInfo& tree, std::size_t index) {
  std::vector<std::size_t> positions;
  for (; index != 0; index = tree.nodes[index].parent) positions.push_back(tree.nodes[index].position);
  std::string pointer = "/root";
  for (auto position = positions.rbegin(); position != positions.rend(); ++position)
    pointer += "/children/" + std::to_string(*position);
  return pointer;
}

// Everything of a NODE up to its "children" key, the object's brace written already.
void WriteNodeFields(const TreeInfo& tree, const TreeNodeInfo& node, std::size_t level, std::ostream& out) {
  const std::string inner = Indent(level + 1);
  auto field = [&](const char* name, const Json& value) {
    out << inner << '"' << name << "\": " << Scalar(value) << ",\n";
  };
  field("name", node.name);
  field("kind", node.kind);
  field("unit", node.unit);
  field("architecture", node.architecture);
  field("instance", node.instance);
  field("path", node.path);
  field("type", node.type);
  field("libraryCell", node.libraryCell);
  field("partition", node.partition);
  field("elementType", OrNull(node.elementType));
  field("file", OrNull(node.file));
  field("fileFullPath", OrNull(node.fileFullPath));
  if (node.sharedWith) {
    field("shared", true);
    field("firstOccurrence", PointerTo(tree, *node.sharedWith));
  }
  if (node.moreBelow > 0) field("moreBelow", node.moreBelow);
  out << inner << "\"children\": ";
}

// The NODE tree in the layout of Write, with an explicit stack: trees can be deep.
void WriteTree(const TreeInfo& tree, std::ostream& out) {
  struct Open {
    std::size_t index;
    std::size_t level;
    std::size_t next;
  };
  std::vector<Open> open;
  auto enter = [&](std::size_t index, std::size_t level) {
    out << "{\n";
    WriteNodeFields(tree, tree.nodes[index], level, out);
    if (tree.nodes[index].children.empty()) {
      out << "[]\n" << Indent(level) << '}';
      return;
    }
    out << "[\n";
    open.push_back({index, level, 0});
  };
  enter(0, 1);
  while (!open.empty()) {
    Open& top = open.back();
    const std::vector<std::size_t>& children = tree.nodes[top.index].children;
    if (top.next == children.size()) {
      out << '\n' << Indent(top.level + 1) << "]\n" << Indent(top.level) << '}';
      open.pop_back();
      continue;
    }
    if (top.next > 0) out << ",\n";
    std::size_t child = children[top.next++];
    std::size_t level = top.level + 2;
    out << Indent(level);
    enter(child, level);
  }
}

Json PortObject(const PortInfo& port) {
  return {{"name", port.name},           {"position", port.position}, {"type", port.type},
          {"direction", port.direction}, {"low", OrNull(port.low)},   {"high", OrNull(port.high)},
          {"span", OrNull(port.span)}};
}

// Names and paths come from the sources byte for byte; bytes that are no UTF-8 are replaced rather
// than refused.
void Write(const Json& document, std::ostream& out) {
  out << document.dump(2, ' ', false, Json::error_handler_t::replace) << '\n';
}

}  // namespace

void JsonOutput::Units(const std::vector<FileInfo>& files, const std::vector<MessageInfo>& messages,
                       std::ostream& out) {
  Json list = Json::array();
  for (const FileInfo& file : files) list.push_back(FileObject(file));
  Write({{"files", std::move(list)}, {"messages", MessageList(messages)}}, out);
}

void JsonOutput::Tree(const TreeInfo* tree, const std::vector<MessageInfo>& messages, std::ostream& out,
                      const std::vector<Diagnostic>& diagnostics) {
  out << "{\n  \"root\": ";
  if (tree && !tree->nodes.empty()) {
    WriteTree(*tree, out);
  } else {
    out << "null";
  }
  // The lists one level in, as Write would lay them out; strings hold no raw line ends.
  auto indented = [](const Json& list) {
    std::string text = list.dump(2, ' ', false, Json::error_handler_t::replace);
    std::string shifted;
    for (char c : text) {
      shifted += c;
      if (c == '\n') shifted += "  ";
    }
    return shifted;
  };
  out << ",\n  \"messages\": " << indented(MessageList(messages));
  out << ",\n  \"diagnostics\": " << indented(DiagnosticList(diagnostics)) << "\n}\n";
}

void JsonOutput::Order(const std::vector<OrderEntry>* order, const VerilogSettings& verilog,
                       const std::vector<MessageInfo>& messages, std::ostream& out,
                       const std::vector<Diagnostic>& diagnostics) {
  Json list = nullptr;
  if (order) {
    list = Json::array();
    for (const OrderEntry& entry : *order) {
      list.push_back({{"path", entry.path},
                      {"fullPath", entry.fullPath},
                      {"library", entry.library},
                      {"plugin", entry.plugin}});
    }
  }
  Write({{"order", std::move(list)},
         {"includeDirs", verilog.includeDirs},
         {"defines", verilog.defines},
         {"messages", MessageList(messages)},
         {"diagnostics", DiagnosticList(diagnostics)}},
        out);
}

void JsonOutput::Check(std::size_t files, std::size_t units, const std::vector<MessageInfo>& messages,
                       const std::vector<Diagnostic>& diagnostics, std::ostream& out) {
  Write({{"files", files},
         {"units", units},
         {"messages", MessageList(messages)},
         {"diagnostics", DiagnosticList(diagnostics)}},
        out);
}

void JsonOutput::Ports(const std::string& unit, const std::vector<PortInfo>* ports,
                       const std::vector<MessageInfo>& messages, std::ostream& out) {
  Json list = nullptr;
  if (ports) {
    list = Json::array();
    for (const PortInfo& port : *ports) list.push_back(PortObject(port));
  }
  Write({{"unit", unit}, {"ports", std::move(list)}, {"messages", MessageList(messages)}}, out);
}

void JsonOutput::Messages(const std::vector<MessageInfo>& messages, std::ostream& out) {
  Write({{"messages", MessageList(messages)}}, out);
}

}  // namespace quillon
