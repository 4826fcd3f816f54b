#include "vci/Hx_VpiAccess.h"

#include <utility>
#include <vector>

#include "vci/Hx_VpiConstants.h"

Hx_VpiAccess::Hx_VpiAccess(Hx_VpiHandlePtr design) : design_(std::move(design)) {}

Hx_VpiIteratorPtr Hx_VpiAccess::iterate(int type, const Hx_VpiHandlePtr& reference) const {
  const Hx_VpiHandlePtr& container = reference ? reference : design_;
  if (!container) {
    return nullptr;
  }
  std::vector<Hx_VpiHandlePtr> objects = container->GetChildren(type);
  if (objects.empty()) {
    return nullptr;
  }
  return Hx_VpiIteratorPtr::Make(std::move(objects));
}

Hx_VpiHandlePtr Hx_VpiAccess::scan(const Hx_VpiIteratorPtr& iterator) const {
  return iterator ? iterator->Next() : nullptr;
}

Hx_VpiHandlePtr Hx_VpiAccess::handle(int relation, const Hx_VpiHandlePtr& object) const {
  return object ? object->GetRelated(relation) : nullptr;
}

int Hx_VpiAccess::get(int property, const Hx_VpiHandlePtr& object) const {
  return object ? object->GetInt(property) : vpiUndefined;
}

std::string Hx_VpiAccess::get_str(int property, const Hx_VpiHandlePtr& object) const {
  return object ? object->GetStr(property) : std::string();
}
