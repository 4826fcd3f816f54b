// Reads the block tree of one view: the top block and, level by level, the blocks inside it, in
// file order. The walk keeps its own stack instead of recursing, so a deep tree cannot exhaust
// the call stack; nesting is limited to Xdm_FileFormat::kMaxBlockDepth levels.
#pragma once

#include <cstddef>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "xdm/Xdm_Block.h"
#include "xdm/Xdm_ObjectReader.h"
#include "xdm/Xdm_View.h"

class Xdm_BlockTreeReader {
 public:
  static constexpr const char* kTooDeepMessage = "nests blocks deeper than 10000 levels";

  // `location` is the JSON pointer of the top block, for messages about `file`.
  Xdm_BlockTreeReader(std::string file, std::string location);

  // Gives `view` the top block read from `value` with everything inside it; throws
  // Xdm_Exception::Base naming the file and the block when a block is malformed.
  void Read(const nlohmann::json& value, Xdm_View* view);

 private:
  // The inner blocks of `owner` and how many of them have been read.
  struct Level {
    const nlohmann::json* blocks;
    std::size_t next;
    Xdm_Block* owner;
  };

  void ReadTree(const nlohmann::json& value, Xdm_View* view);
  // Reads the properties of `block` and opens a level for its inner blocks, if it has any.
  void ReadContent(const Xdm_ObjectReader& reader, Xdm_Block* block);
  // The JSON pointer of the block being read.
  std::string CurrentLocation() const;

  std::string file_;
  std::string location_;
  std::vector<Level> levels_;
};
