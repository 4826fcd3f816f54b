// Reads one file as a JSON document, within the size and nesting limits of Xdm_FileFormat.
#pragma once

#include <nlohmann/json.hpp>
#include <string>

class Xdm_JsonFile {
 public:
  // Problems, as they appear after the file name in the thrown message.
  static constexpr const char* kCannotReadMessage = "cannot be read";
  static constexpr const char* kNotRegularFileMessage = "is not a regular file";
  static constexpr const char* kTooLargeMessage = "is larger than the 512 MiB a netlist database may have";
  static constexpr const char* kNotJsonMessage = "is not JSON";
  static constexpr const char* kTooDeepMessage = "nests JSON values deeper than the format allows";

  // The document in `file`; throws Xdm_Exception::Base naming the file when it cannot be read,
  // is not a regular file, is too large, is not JSON or nests too deeply.
  static nlohmann::json Load(const std::string& file);

 private:
  static std::string ReadText(const std::string& file);
  static nlohmann::json Parse(const std::string& text, const std::string& file);
};
