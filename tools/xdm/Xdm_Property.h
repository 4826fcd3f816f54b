// A named text value attached to a design, view or block.
#pragma once

#include <string>

class Xdm_Property {
 public:
  Xdm_Property(std::string name, std::string value);

  const std::string& GetName() const { return name_; }
  const std::string& GetValue() const { return value_; }
  void SetValue(std::string value);

 private:
  std::string name_;
  std::string value_;
};
