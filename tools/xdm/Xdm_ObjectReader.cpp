#include "xdm/Xdm_ObjectReader.h"

#include <algorithm>

#include "xdm/Xdm_FormatProblem.h"

namespace {

std::string Quoted(std::string_view name) { return "\"" + std::string(name) + "\""; }

}  // namespace

Xdm_ObjectReader::Xdm_ObjectReader(const nlohmann::json& value,
                                   std::initializer_list<std::string_view> allowed)
    : value_(value) {
  if (!value_.is_object()) {
    throw Xdm_FormatProblem(kNotObjectMessage);
  }
  for (const auto& member : value_.items()) {
    if (std::find(allowed.begin(), allowed.end(), member.key()) == allowed.end()) {
      throw Xdm_FormatProblem(kUnknownMemberMessage + Quoted(member.key()));
    }
  }
}

const std::string& Xdm_ObjectReader::Name() const {
  const nlohmann::json& name = Required("name");
  if (!name.is_string()) {
    throw Xdm_FormatProblem(Quoted("name") + kNotTextMessage);
  }
  const std::string& text = name.get_ref<const std::string&>();
  if (text.empty()) {
    throw Xdm_FormatProblem(kEmptyNameMessage);
  }
  return text;
}

const nlohmann::json& Xdm_ObjectReader::Required(const char* member) const {
  auto found = value_.find(member);
  if (found == value_.end()) {
    throw Xdm_FormatProblem(kMissingMemberMessage + Quoted(member));
  }
  return *found;
}

const nlohmann::json* Xdm_ObjectReader::OptionalArray(const char* member) const {
  return value_.contains(member) ? &RequiredArray(member) : nullptr;
}

const nlohmann::json& Xdm_ObjectReader::RequiredArray(const char* member) const {
  const nlohmann::json& array = Required(member);
  if (!array.is_array()) {
    throw Xdm_FormatProblem(Quoted(member) + kNotArrayMessage);
  }
  return array;
}

void Xdm_ObjectReader::ReadProperties(Xdm_PropertyHolder* holder) const {
  auto properties = value_.find("properties");
  if (properties == value_.end()) {
    return;
  }
  if (!properties->is_object()) {
    throw Xdm_FormatProblem(Quoted("properties") + " " + kNotObjectMessage);
  }
  for (const auto& property : properties->items()) {
    if (!property.value().is_string()) {
      throw Xdm_FormatProblem("property " + Quoted(property.key()) + kPropertyNotTextMessage);
    }
    holder->SetProperty(property.key(), property.value().get<std::string>());
  }
}
