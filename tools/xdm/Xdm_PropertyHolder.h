// Base of every netlist object that carries properties ("PART", "TYPE", "PARTITION", ...).
#pragma once

#include <functional>
#include <map>
#include <memory>
#include <string>

#include "xdm/Xdm_Property.h"

class Xdm_PropertyHolder {
 public:
  Xdm_PropertyHolder(const Xdm_PropertyHolder&) = delete;
  Xdm_PropertyHolder& operator=(const Xdm_PropertyHolder&) = delete;
  virtual ~Xdm_PropertyHolder();

  // The property of that exact name, owned by this object; null when there is none or `name` is
  // null.
  const Xdm_Property* GetPropertyByName(const char* name) const;

  // Adds the property, or replaces the value of the property of that name.
  void SetProperty(const std::string& name, std::string value);

 protected:
  Xdm_PropertyHolder() = default;

 private:
  std::map<std::string, std::unique_ptr<Xdm_Property>, std::less<>> properties_;
};
