#include "xdm/Xdm_Block.h"

#include <utility>

Xdm_Block::Xdm_Block(std::string name, Xdm_Block* parent) : name_(std::move(name)), parent_(parent) {}

// Inner blocks are released from a list of our own rather than by each destructor in turn, so
// that a deeply nested tree cannot exhaust the call stack.
Xdm_Block::~Xdm_Block() {
  std::vector<std::unique_ptr<Xdm_Block>> pending = std::move(blocks_);
  while (!pending.empty()) {
    std::unique_ptr<Xdm_Block> block = std::move(pending.back());
    pending.pop_back();
    for (auto& inner : block->blocks_) {
      pending.push_back(std::move(inner));
    }
    block->blocks_.clear();
  }
}

int Xdm_Block::GetNumBlocks() const { return static_cast<int>(blocks_.size()); }

Xdm_Block* Xdm_Block::AddBlock(std::string name) {
  blocks_.push_back(std::make_unique<Xdm_Block>(std::move(name), this));
  return blocks_.back().get();
}
