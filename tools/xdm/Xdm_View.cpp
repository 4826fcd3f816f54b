#include "xdm/Xdm_View.h"

#include <utility>

Xdm_View::Xdm_View(std::string name) : name_(std::move(name)) {}

Xdm_View::~Xdm_View() = default;

Xdm_Block* Xdm_View::SetBlock(std::string name) {
  block_ = std::make_unique<Xdm_Block>(std::move(name), nullptr);
  return block_.get();
}
