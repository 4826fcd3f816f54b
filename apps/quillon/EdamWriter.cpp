#include "EdamWriter.h"

#include <algorithm>
#include <filesystem>
#include <nlohmann/json.hpp>
#include <set>

namespace quillon {

namespace {

using Json = nlohmann::ordered_json;

const char* FileType(SourceLanguage language) {
  switch (language) {
    case SourceLanguage::kVhdl:
      return "vhdlSource-2008";
    case SourceLanguage::kVerilog:
      return "verilogSource";
    case SourceLanguage::kSystemVerilog:
      return "systemVerilogSource";
  }
  return "user";
}

// The header files directly in `directory`, sorted; none when it cannot be read.
std::vector<std::string> HeadersIn(const std::string& directory) {
  namespace fs = std::filesystem;
  std::vector<std::string> headers;
  std::error_code failure;
  fs::directory_iterator entries(directory, failure);
  if (failure) return headers;
  const std::vector<std::string>& extensions = EdamWriter::HeaderExtensions();
  for (const fs::directory_entry& entry : entries) {
    std::string extension = entry.path().extension().string();
    if (entry.is_regular_file(failure) &&
        std::find(extensions.begin(), extensions.end(), extension) != extensions.end())
      headers.push_back(entry.path().string());
  }
  std::sort(headers.begin(), headers.end());
  return headers;
}

Json Parameter(const std::string& define) {
  std::size_t equals = define.find('=');
  if (equals == std::string::npos)
    return {{"datatype", "bool"}, {"default", true}, {"paramtype", "vlogdefine"}};
  return {{"datatype", "str"}, {"default", define.substr(equals + 1)}, {"paramtype", "vlogdefine"}};
}

}  // namespace

const std::vector<std::string>& EdamWriter::HeaderExtensions() {
  static const std::vector<std::string> extensions = {".vh", ".svh", ".vinc", ".inc", ".h"};
  return extensions;
}

void EdamWriter::Write(const ExportPlan& plan, std::ostream& out) {
  Json files = Json::array();
  std::set<std::string> listed;
  for (const std::string& directory : plan.includeDirs) {
    for (const std::string& header : HeadersIn(directory)) {
      if (!listed.insert(header).second) continue;
      const bool system = header.ends_with(".svh");
      files.push_back({{"name", header},
                       {"file_type", system ? "systemVerilogSource" : "verilogSource"},
                       {"is_include_file", true},
                       {"include_path", directory}});
    }
  }
  for (const ExportSource& source : plan.sources) {
    if (!listed.insert(source.path).second) continue;
    files.push_back({{"name", source.path},
                     {"file_type", FileType(source.language)},
                     {"logical_name", source.library},
                     {"is_include_file", false}});
  }
  Json parameters = Json::object();
  for (const std::string& define : plan.defines)
    parameters[define.substr(0, define.find('='))] = Parameter(define);
  Json edam = {{"name", plan.top ? plan.top->name : std::string("quillon")}, {"files", std::move(files)}};
  if (plan.top) edam["toplevel"] = plan.top->name;
  edam["parameters"] = std::move(parameters);
  out << edam.dump(2, ' ', false, Json::error_handler_t::replace) << '\n';
}

}  // namespace quillon
