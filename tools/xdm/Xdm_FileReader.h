// Reads a netlist database file (format in Xdm_FileFormat.h) into a design manager.
#pragma once

#include <nlohmann/json.hpp>
#include <string>
#include <utility>

#include "xdm/Xdm_DesignMgr.h"

class Xdm_FileReader {
 public:
  static constexpr const char* kNotNetlistMessage =
      "is not a netlist database (it needs \"format\": \"quillon-netlist\")";
  static constexpr const char* kUnsupportedVersionMessage = "has a version other than \"version\": 1";
  static constexpr const char* kOutOfMemoryMessage = "is too large to be held in memory";
  static constexpr const char* kUnexpectedMessage = "cannot be read: ";

  // True when `file` is a readable regular file holding a JSON document with the format marker
  // and version; the rest of the document is not checked.
  static bool IsNetlistDatabase(const std::string& file) noexcept;

  // Adds the designs of `file`, in file order, to `designs`. Throws Xdm_Exception::Base, and
  // nothing else, naming the file and the place of the first problem; `designs` may then hold
  // part of the file.
  static void Read(const std::string& file, Xdm_DesignMgr* designs);

 private:
  explicit Xdm_FileReader(std::string file) : file_(std::move(file)) {}

  // Throws Xdm_FormatProblem unless `document` carries the marker and version.
  static void CheckMarker(const nlohmann::json& document);
  void ReadDocument(const nlohmann::json& document, Xdm_DesignMgr* designs) const;
  void ReadDesign(const nlohmann::json& value, const std::string& location, Xdm_DesignMgr* designs) const;
  void ReadView(const nlohmann::json& value, const std::string& location, Xdm_Design* design) const;

  std::string file_;
};
