#include "vci/Hx_VpiObject.h"

#include <utility>

#include "vci/Hx_VpiConstants.h"

Hx_VpiObject::Hx_VpiObject(int type) : type_(type) {}

Hx_VpiObject::~Hx_VpiObject() = default;

int Hx_VpiObject::GetInt(int property) const {
  auto found = ints_.find(property);
  return found == ints_.end() ? vpiUndefined : found->second;
}

void Hx_VpiObject::SetInt(int property, int value) { ints_[property] = value; }

std::string Hx_VpiObject::GetStr(int property) const {
  auto found = strs_.find(property);
  return found == strs_.end() ? std::string() : found->second;
}

void Hx_VpiObject::SetStr(int property, std::string value) { strs_[property] = std::move(value); }

Hx_VpiHandlePtr Hx_VpiObject::GetRelated(int relation) const {
  auto found = relations_.find(relation);
  return found == relations_.end() ? nullptr : found->second;
}

void Hx_VpiObject::SetRelated(int relation, Hx_VpiHandlePtr target) {
  if (!target) {
    relations_.erase(relation);
    return;
  }
  relations_[relation] = std::move(target);
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
