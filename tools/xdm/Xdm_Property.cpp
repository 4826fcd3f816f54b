#include "xdm/Xdm_Property.h"

#include <utility>

Xdm_Property::Xdm_Property(std::string name, std::string value)
    : name_(std::move(name)), value_(std::move(value)) {}

void Xdm_Property::SetValue(std::string value) { value_ = std::move(value); }
