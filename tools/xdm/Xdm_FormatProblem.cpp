#include "xdm/Xdm_FormatProblem.h"

Xdm_Exception::Base Xdm_FormatProblem::Error(const std::string& file, const std::string& location,
                                             const std::string& problem) {
  std::string message = "netlist database \"" + file + "\"";
  if (!location.empty()) {
    message += " at " + location;
  }
  return Xdm_Exception::Base(message + ": " + problem);
}
