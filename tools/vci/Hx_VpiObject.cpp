#include "vci/Hx_VpiObject.h"

#include <utility>

#include "vci/Hx_VpiConstants.h"

Hx_VpiObject::Hx_VpiObject(int type) : type_(type) {}

Hx_VpiObject::~Hx_VpiObject() = default;

int Hx_VpiObject::GetInt(int property) const {
  const int* value = ints_.Find(property);
  return value ? *value : vpiUndefined;
}

void Hx_VpiObject::SetInt(int property, int value) { ints_.Set(property, value); }

std::string Hx_VpiObject::GetStr(int property) const {
  const std::string* value = strs_.Find(property);
  return value ? *value : std::string();
}

void Hx_VpiObject::SetStr(int property, std::string value) { strs_.Set(property, std::move(value)); }

Hx_VpiHandlePtr Hx_VpiObject::GetRelated(int relation) const {
  const Hx_VpiHandlePtr* target = relations_.Find(relation);
  return target ? *target : nullptr;
}

void Hx_VpiObject::SetRelated(int relation, Hx_VpiHandlePtr target) {
  if (!target) {
    relations_.Erase(relation);
    return;
  }
  relations_.Set(relation, std::move(target));
}

void Hx_VpiObject::AddChild(Hx_VpiHandlePtr child) {
  if (child) {
    children_.push_back(std::move(child));
  }
}

std::vector<Hx_VpiHandlePtr> Hx_VpiObject::GetChildren(int type) const {
  std::vector<Hx_VpiHandlePtr> selected;
  for (const Hx_VpiHandlePtr& child : children_) {
    if (child->GetType() == type) {
      selected.push_back(child);
    }
  }
  return selected;
}
