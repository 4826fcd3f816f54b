// Typed access to the members of one object of a netlist database document. Every problem is
// thrown as Xdm_FormatProblem; the caller adds where the object sits.
#pragma once

#include <initializer_list>
#include <nlohmann/json.hpp>
#include <string>
#include <string_view>

#include "xdm/Xdm_PropertyHolder.h"

class Xdm_ObjectReader {
 public:
  static constexpr const char* kNotObjectMessage = "must be an object";
  static constexpr const char* kUnknownMemberMessage = "has the unknown member ";
  static constexpr const char* kMissingMemberMessage = "lacks the member ";
  static constexpr const char* kNotTextMessage = " must be a text";
  static constexpr const char* kEmptyNameMessage = "\"name\" must not be empty";
  static constexpr const char* kNotArrayMessage = " must be an array";
  static constexpr const char* kPropertyNotTextMessage = " must have a text value";

  // `value` must be an object whose members are all named in `allowed`; it must outlive the
  // reader.
  Xdm_ObjectReader(const nlohmann::json& value, std::initializer_list<std::string_view> allowed);

  // The member "name", a non-empty text.
  const std::string& Name() const;
  // The member `member`, which must be present.
  const nlohmann::json& Required(const char* member) const;
  // The member `member` when it is an array; null when it is absent.
  const nlohmann::json* OptionalArray(const char* member) const;
  // The member `member`, which must be an array.
  const nlohmann::json& RequiredArray(const char* member) const;
  // Copies the text values of the optional member "properties" onto `holder`.
  void ReadProperties(Xdm_PropertyHolder* holder) const;

 private:
  const nlohmann::json& value_;
};
