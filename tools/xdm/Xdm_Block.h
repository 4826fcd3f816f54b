// A cell or instance of a netlist view; blocks nest, and a block without inner blocks is a
// primitive.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "xdm/Xdm_Itr.h"
#include "xdm/Xdm_PropertyHolder.h"

class Xdm_Block;
using Xdm_BlockItr = Xdm_Itr<Xdm_Block>;

class Xdm_Block : public Xdm_PropertyHolder {
 public:
  // `parent` is null for the top block of a view; it is not owned.
  Xdm_Block(std::string name, Xdm_Block* parent);
  ~Xdm_Block() override;

  const std::string& GetName() const { return name_; }
  Xdm_Block* GetParent() const { return parent_; }
  int GetNumBlocks() const;
  // The inner blocks in the order they were added; valid while this block lives.
  Xdm_BlockItr GetBlockItr() const { return Xdm_BlockItr(blocks_); }

  // Creates an inner block whose parent is this block; this block owns it.
  Xdm_Block* AddBlock(std::string name);

 private:
  std::string name_;
  Xdm_Block* parent_;
  std::vector<std::unique_ptr<Xdm_Block>> blocks_;
};
