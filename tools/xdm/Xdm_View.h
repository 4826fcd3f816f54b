// One view of a design (for example "SOURCE"), holding the view's top block.
#pragma once

#include <memory>
#include <string>

#include "xdm/Xdm_Block.h"
#include "xdm/Xdm_PropertyHolder.h"

class Xdm_View : public Xdm_PropertyHolder {
 public:
  explicit Xdm_View(std::string name);
  ~Xdm_View() override;

  const std::string& GetName() const { return name_; }
  // The top block, owned by the view; null while the view has none.
  Xdm_Block* GetBlock() const { return block_.get(); }

  // Creates the top block (without a parent), replacing any earlier one.
  Xdm_Block* SetBlock(std::string name);

 private:
  std::string name_;
  std::unique_ptr<Xdm_Block> block_;
};
