#include "xdm/Xdm_Design.h"

#include <utility>

Xdm_Design::Xdm_Design(std::string name) : name_(std::move(name)) {}

Xdm_Design::~Xdm_Design() = default;

Xdm_View* Xdm_Design::GetViewByName(const char* name) const {
  if (name == nullptr) {
    return nullptr;
  }
  for (const auto& view : views_) {
    if (view->GetName() == name) {
      return view.get();
    }
  }
  return nullptr;
}

Xdm_View* Xdm_Design::AddView(std::string name) {
  views_.push_back(std::make_unique<Xdm_View>(std::move(name)));
  return views_.back().get();
}
