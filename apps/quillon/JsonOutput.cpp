#include "JsonOutput.h"

#include <nlohmann/json.hpp>

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
  return {
      {"path", file.path}, {"plugin", file.plugin}, {"library", file.library}, {"units", std::move(units)}};
}

Json NodeObject(const TreeNodeInfo& node) {
  Json children = Json::array();
  for (const TreeNodeInfo& child : node.children) children.push_back(NodeObject(child));
  return {{"name", node.name},           {"kind", node.kind},
          {"unit", node.unit},           {"architecture", node.architecture},
          {"instance", node.instance},   {"path", node.path},
          {"type", node.type},           {"libraryCell", node.libraryCell},
          {"partition", node.partition}, {"elementType", OrNull(node.elementType)},
          {"file", OrNull(node.file)},   {"children", std::move(children)}};
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

void JsonOutput::Tree(const TreeNodeInfo* root, const std::vector<MessageInfo>& messages, std::ostream& out,
                      const std::vector<Diagnostic>& diagnostics) {
  Write({{"root", root ? NodeObject(*root) : Json(nullptr)},
         {"messages", MessageList(messages)},
         {"diagnostics", DiagnosticList(diagnostics)}},
        out);
}

void JsonOutput::Order(const std::vector<OrderEntry>* order, const std::vector<MessageInfo>& messages,
                       std::ostream& out, const std::vector<Diagnostic>& diagnostics) {
  Json list = nullptr;
  if (order) {
    list = Json::array();
    for (const OrderEntry& entry : *order) {
      list.push_back({{"path", entry.path}, {"library", entry.library}, {"plugin", entry.plugin}});
    }
  }
  Write({{"order", std::move(list)},
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
