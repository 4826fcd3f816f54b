// What an export hands to the compiling tools: the sources in compile order with what each needs
// compiled before it, and the Verilog include directories, macros and the top unit.
#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

namespace quillon {

enum class SourceLanguage { kVhdl, kVerilog, kSystemVerilog };

struct ExportSource {
  std::string path;
  std::string library;
  SourceLanguage language = SourceLanguage::kVhdl;
  // Indices of earlier sources that must be compiled before this one, ascending.
  std::vector<std::size_t> needs;
};

struct ExportTop {
  std::string library;
  std::string name;          // the entity or module
  std::string architecture;  // empty: the default one
  bool verilog = false;      // a module
};

struct ExportPlan {
  std::vector<ExportSource> sources;  // in compile order
  std::vector<std::string> includeDirs;
  std::vector<std::string> defines;  // NAME or NAME=VALUE
  std::optional<ExportTop> top;
};

}  // namespace quillon
