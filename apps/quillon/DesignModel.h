// Plain values that the commands read out of the module and the writers print. Nothing here holds
// an interface pointer, so the writers never talk to the module.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace quillon {

// The file name after the last '/' of `path`.
inline std::string_view BaseNameOf(std::string_view path) {
  std::size_t slash = path.rfind('/');
  return slash == std::string_view::npos ? path : path.substr(slash + 1);
}

// A message of the host message system, as the JSON output lists it.
struct MessageInfo {
  std::string severity;  // "error", "warning" or "info"
  std::string text;
  std::string source;  // a file's path, as shown once ShownPaths applied, or a program's name
  int line = 0;
  std::string sourceFullPath = {};  // set by ShownPaths
};

// One record of a file's design-unit set. Fields that a record kind does not have stay unset.
struct UnitInfo {
  std::string type;  // type name, as "Entity"
  std::string name;
  std::string key;  // design-unit key
  std::string storeKey;
  std::uint32_t line = 0;
  std::optional<std::string> parent;  // the parent's store key
  bool inGenerate = false;
  bool unitFlag = false;
  std::string partition;
  std::optional<std::string> entity;
  std::optional<std::string> architecture;
  std::optional<std::string> component;
  std::optional<std::string> library;
  std::optional<std::string> package;
  std::optional<std::string> item;
  std::optional<std::vector<std::string>> uses;  // store keys of the use records of a VHDL unit
};

struct FileInfo {
  std::string path;  // full, or as shown once ShownPaths applied
  std::string plugin;
  std::string library;
  std::vector<UnitInfo> units;
  std::string fullPath = {};  // set by ShownPaths
};

struct TreeNodeInfo {
  std::string name;
  std::string kind;
  std::string unit;
  std::string architecture;
  std::string instance;
  std::string path;
  std::string type;
  bool libraryCell = false;
  std::string partition;
  std::optional<std::string> elementType;
  std::optional<std::string> elementKey;  // design-unit key of the node's element
  std::optional<std::string> file;
  std::optional<std::string> library;       // the library of the element's file
  std::optional<std::string> fileFullPath;  // set by ShownPaths
  // Indices of the children in TreeInfo::nodes, in child order.
  std::vector<std::size_t> children;
  // Set on a later occurrence of a shared subtree: the index of its first occurrence. Such an
  // entry has no children of its own.
  std::optional<std::size_t> sharedWith;
  // The parent's index and this node's place among its children; zero for the root.
  std::size_t parent = 0;
  std::size_t position = 0;
  // How many nodes a depth limit left out below this one.
  std::size_t moreBelow = 0;
};

// A hierarchy as a flat list in pre-order, the root first. A subtree that several parents share
// is listed in full where it is met first; later occurrences are single entries pointing there.
// Flat, so that neither reading, printing nor freeing a deep tree recurses.
struct TreeInfo {
  std::vector<TreeNodeInfo> nodes;
  const TreeNodeInfo& Root() const { return nodes.front(); }
};

struct OrderEntry {
  std::string path;  // full, or as shown once ShownPaths applied
  std::string library;
  std::string plugin;
  std::string fullPath = {};  // set by ShownPaths
};

// The project's Verilog include directories and macros (NAME or NAME=VALUE), in the order given.
struct VerilogSettings {
  std::vector<std::string> includeDirs;
  std::vector<std::string> defines;
};

// One port of a design unit; the bounds are unset when the port has no range.
struct PortInfo {
  std::string name;
  std::uint32_t position = 0;
  std::string type;
  std::string direction;  // "in", "out" or "inout"
  std::optional<std::int32_t> low;
  std::optional<std::int32_t> high;
  std::optional<std::int32_t> span;
};

// The file dependency graph of a compile order: an edge from a file to a file it uses.
struct FileEdge {
  std::size_t from = 0;
  std::size_t to = 0;
  bool onCycle = false;
};

struct FileGraphInfo {
  std::vector<OrderEntry> files;
  std::vector<FileEdge> edges;
};

}  // namespace quillon
