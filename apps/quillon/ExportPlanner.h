// Turns a compile order and its file dependency graph into the plan that every export format
// writes.
#pragma once

#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "DesignModel.h"
#include "ExportModel.h"

namespace quillon {

class ExportPlanner {
 public:
  // The entries of one of the module's list properties (macros, include directories), which it
  // separates with ';' or '|'; empty entries dropped.
  static std::vector<std::string> ListEntries(std::string_view list);
  // The Verilog include directories and macros among a project's properties.
  static VerilogSettings VerilogSettingsOf(const std::map<std::string, std::string>& properties);

  // The plan of a project's `order`: the file dependencies of its hierarchy `tree`, its Verilog
  // settings and, when `topKey` is not empty, the top that the key names (unset when the unit is
  // no entity, architecture or module). Returns false as Plan does. `leftOut` receives one warning
  // text per source that no compiling tool takes.
  static bool PlanProject(const std::vector<OrderEntry>& order, const TreeInfo& tree,
                          const std::vector<FileInfo>& files, const VerilogSettings& verilog,
                          const std::string& topKey, ExportPlan& plan, std::vector<std::string>& leftOut,
                          std::string& error);

  // The VHDL and Verilog sources of `order` in its order. A source needs the sources it uses
  // (edges of `graph`) that come before it, and a Verilog source also the Verilog source before
  // it, whose macros it sees. Paths of sources of other kinds go to `leftOut`. False with a
  // reason in `error` when a path holds a line break or a library name is no plain identifier:
  // neither can be written into every format.
  static bool Plan(const std::vector<OrderEntry>& order, const FileGraphInfo& graph, ExportPlan& plan,
                   std::vector<std::string>& leftOut, std::string& error);

  // The top that a design-unit key names (Entity|cpu, Architecture|cpu|rtl, Module|top), with
  // the library of the file that holds it; unset for any other kind of unit.
  static std::optional<ExportTop> TopOf(const std::string& key, const std::vector<FileInfo>& files);
};

}  // namespace quillon
