#include "xdm/Xdm_PropertyHolder.h"

#include <string_view>
#include <utility>

Xdm_PropertyHolder::~Xdm_PropertyHolder() = default;

const Xdm_Property* Xdm_PropertyHolder::GetPropertyByName(const char* name) const {
  if (name == nullptr) {
    return nullptr;
  }
  auto found = properties_.find(std::string_view(name));
  return found == properties_.end() ? nullptr : found->second.get();
}

void Xdm_PropertyHolder::SetProperty(const std::string& name, std::string value) {
  auto found = properties_.find(name);
  if (found != properties_.end()) {
    found->second->SetValue(std::move(value));
    return;
  }
  properties_.emplace(name, std::make_unique<Xdm_Property>(name, std::move(value)));
}
