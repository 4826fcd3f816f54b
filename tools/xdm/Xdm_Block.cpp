#include "xdm/Xdm_Block.h"

#include <utility>

Xdm_Block::Xdm_Block(std::string name, Xdm_Block* parent) : name_(std::move(name)), parent_(parent) {}

Xdm_Block::~Xdm_Block() = default;

int Xdm_Block::GetNumBlocks() const { return static_cast<int>(blocks_.size()); }

Xdm_Block* Xdm_Block::AddBlock(std::string name) {
  blocks_.push_back(std::make_unique<Xdm_Block>(std::move(name), this));
  return blocks_.back().get();
}
